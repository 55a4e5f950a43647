#include "tests/support/TestNetwork.h"

#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cstdio>
#include <map>
#include <sstream>

namespace qvtest {

namespace {

// 8 characters: "q", the process id and a counter in hex, so that runs of parallel test
// programs and the networks of one program that are up at once differ.
std::string uniquePrefix() {
    static std::atomic<unsigned> counter{0};
    char prefix[16];
    std::snprintf(prefix, sizeof prefix, "q%06x%x", static_cast<unsigned>(getpid()) & 0xFFFFFFU,
                  counter++ % 16);
    return prefix;
}

std::string shellQuoted(const std::string& text) {
    std::string quoted = "'";
    for (char c : text) {
        quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    }
    return quoted + "'";
}

// The words "key=value" of a line of the tool's layout.
std::map<std::string, std::string> layoutWords(const std::string& line) {
    std::map<std::string, std::string> words;
    std::istringstream in(line);
    for (std::string word; in >> word;) {
        if (const auto equals = word.find('='); equals != std::string::npos) {
            words[word.substr(0, equals)] = word.substr(equals + 1);
        }
    }
    return words;
}

TestClock clockOf(std::map<std::string, std::string>& words) {
    auto number = [&words](const char* key) { return std::stoul(words[key]); };
    TestClock clock{words["impl"],
                    words["ns"],
                    words["mac"],
                    {},
                    static_cast<std::uint16_t>(number("port")),
                    static_cast<std::uint8_t>(number("domain")),
                    static_cast<std::uint8_t>(number("prio1")),
                    static_cast<std::uint8_t>(number("prio2")),
                    words["desc"],
                    words["bridge"]};
    for (std::size_t i = 0; i < clock.identity.size() && words["identity"].size() == 16; ++i) {
        clock.identity[i] =
            static_cast<std::uint8_t>(std::stoul(words["identity"].substr(2 * i, 2), nullptr, 16));
    }
    return clock;
}

}  // namespace

CommandResult runCommand(const std::string& commandLine) {
    CommandResult result;
    FILE* pipe = popen((commandLine + " 2>&1").c_str(), "r");
    if (pipe == nullptr) {
        result.output = "cannot start: " + commandLine;
        return result;
    }
    char buffer[4096];
    for (std::size_t count; (count = fread(buffer, 1, sizeof buffer, pipe)) > 0;) {
        result.output.append(buffer, count);
    }
    const int status = pclose(pipe);
    if (status != -1 && WIFEXITED(status)) {
        result.exitStatus = WEXITSTATUS(status);
    }
    return result;
}

TestNetwork::TestNetwork(const std::vector<std::string>& clockSpecs) : prefix_(uniquePrefix()) {
    std::string command = shellQuoted(toolPath()) + " up " + prefix_;
    for (const auto& clockSpec : clockSpecs) {
        command += " " + shellQuoted(clockSpec);
    }
    started_ = true;
    const CommandResult result = runCommand(command);
    if (result.exitStatus != 0) {
        failure_ = "tools/testnet up " + prefix_ + " failed: " + result.output;
        return;
    }
    up_ = parseLayout(result.output);
    if (!up_) {
        failure_ = "unexpected output of tools/testnet up: " + result.output;
    }
}

void TestNetwork::down() {
    if (started_) {
        runCommand(shellQuoted(toolPath()) + " down " + prefix_);
        started_ = false;
        up_ = false;
    }
}

CommandResult TestNetwork::runInClient(const std::string& commandLine) const {
    return runCommand("ip netns exec " + shellQuoted(clientNamespace_) + " sh -c " +
                      shellQuoted(commandLine));
}

bool TestNetwork::parseLayout(const std::string& layout) {
    std::istringstream lines(layout);
    for (std::string line; std::getline(lines, line);) {
        auto words = layoutWords(line);
        if (line.rfind("client ", 0) == 0) {
            clientNamespace_ = words["ns"];
            clientAddress_ = words["addr"];
        } else if (line.rfind("clock ", 0) == 0) {
            clocks_.push_back(clockOf(words));
            const int pid = std::stoi(words["pid"]);
            if (pid > 0) {
                processIds_.push_back(pid);
            }
        }
    }
    return !clientNamespace_.empty();
}

}  // namespace qvtest
