#include "tests/expert/network/LoadedExpert.h"

#include <dlfcn.h>

#include <chrono>
#include <cstdio>
#include <sstream>
#include <thread>

namespace qvtest {

LoadedExpert::LoadedExpert() {
    library_ = ::dlopen(QV_EXPERT_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    if (library_ == nullptr) {
        failure_ = ::dlerror();
        return;
    }
    create_ = reinterpret_cast<createCorbelExpertFunction>(::dlsym(library_, "createCorbelExpert"));
    if (create_ == nullptr) {
        failure_ = "no createCorbelExpert";
    }
}

LoadedExpert::~LoadedExpert() {
    if (library_ != nullptr) {
        ::dlclose(library_);
    }
}

std::map<std::string, std::string> pmcValues(const TestNetwork& network, const TestClock& clock,
                                             const std::string& managementId) {
    const CommandResult result =
        network.runInClient("pmc -4 -i " + clock.bridge + " -b 0 -d " +
                            std::to_string(clock.domain) + " 'GET " + managementId + "'");
    std::map<std::string, std::string> values;
    std::istringstream lines(result.output);
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::string name;
        std::string value;
        if (line.starts_with("\t\t") && words >> name && std::getline(words >> std::ws, value)) {
            values[name] = value.substr(0, value.find_last_not_of(' ') + 1);
        }
    }
    return values;
}

std::vector<std::string> requestsSentDuring(const TestNetwork& network,
                                            const std::vector<std::string>& bridges,
                                            const std::function<void()>& action) {
    std::vector<std::thread> captures;
    std::vector<std::string> files, requests;
    for (const std::string& bridge : bridges) {
        files.push_back("/tmp/qv-expert-" + network.prefix() + "-" + bridge + ".pcap");
        captures.emplace_back([&network, &bridge, file = files.back()] {
            network.runInClient("timeout 3 tcpdump -U -i " + bridge + " -w " + file +
                                " udp port 320");
        });
    }
    for (const std::string& file : files) {
        for (int i = 0; i < 100 && runCommand("test -s " + file).exitStatus != 0; ++i) {
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
    }
    action();
    for (std::thread& capture : captures) {
        capture.join();
    }
    for (const std::string& file : files) {
        requests.push_back(runCommand("tshark -r " + file +
                                      " -Y 'ptp.v2.mm.action == 1 || ptp.v2.mm.action == 3' -T "
                                      "fields -e ptp.v2.mm.managementId 2>/dev/null; rm -f " +
                                      file)
                               .output);
    }
    return requests;
}

std::u16string itemNameOf(const TestClock& clock) {
    char text[40];
    const auto& id = clock.identity;
    std::snprintf(text, sizeof text, "%.2X-%.2X-%.2X-%.2X-%.2X-%.2X-%.2X-%.2X:%u", id[0], id[1],
                  id[2], id[3], id[4], id[5], id[6], id[7], clock.portNumber);
    return std::u16string(text, text + std::char_traits<char>::length(text));
}

}  // namespace qvtest
