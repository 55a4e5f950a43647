#include "tests/network/ManagementClient.h"

#include <cstdio>
#include <sstream>

#include "tests/support/NetworkNamespaceEntry.h"

namespace qvtest {

using nQVPTPMGMT000::tPTPClockProxy;

ManagementClient::ManagementClient(const std::string& nameSpace) {
    NetworkNamespaceEntry entry(nameSpace);
    if (!entry.entered()) {
        failure_ = "cannot enter " + nameSpace + ": " + entry.failure();
        return;
    }
    tStatus status;
    node_ = std::make_unique<nQVPTPMGMT000::tPTPMgmtNode>(
        &transport_, nQVPTP000::tClockIdentity(kIdentity.data()), kPortNumber, status);
    node_->open(status);
    open_ = status.succeeded();
    if (!open_) {
        failure_ = "node did not open: " + std::to_string(status.code);
    }
}

ManagementClient::~ManagementClient() {
    if (node_) {
        tStatus status;
        node_->close(status);
    }
}

std::vector<tPTPClockProxy*> ManagementClient::findClocks(std::uint16_t timeoutMs,
                                                          tStatus& status) {
    node_->findClocks(timeoutMs, status);
    std::vector<nQVPTPMGMT000::iPTPClockProxy*> proxies(node_->clockCount());
    node_->copyClockProxies(proxies.data(), static_cast<std::uint16_t>(proxies.size()), status);
    std::vector<tPTPClockProxy*> result;
    for (auto* proxy : proxies) {
        result.push_back(static_cast<tPTPClockProxy*>(proxy));
    }
    return result;
}

nQVPTPMGMT000::tClockKey clockKeyOf(const TestClock& clock) {
    nQVPTPMGMT000::tClockKey key{};
    for (std::size_t i = 0; i < clock.identity.size(); ++i) {
        key[i] = clock.identity[i];
    }
    key[8] = static_cast<std::uint8_t>(clock.portNumber >> 8);
    key[9] = static_cast<std::uint8_t>(clock.portNumber & 0xFF);
    return key;
}

std::string pmcClockIdentity(const std::array<std::uint8_t, 8>& identity) {
    char text[32];
    std::snprintf(text, sizeof text, "%02x%02x%02x.%02x%02x.%02x%02x%02x", identity[0], identity[1],
                  identity[2], identity[3], identity[4], identity[5], identity[6], identity[7]);
    return text;
}

std::string describe(const tStatus& status) {
    return std::to_string(status.code) + " at " + status.file + ":" + std::to_string(status.line);
}

std::map<std::string, std::string> pmcGet(const TestNetwork& network, const TestClock& clock,
                                          const std::string& managementId, int domain) {
    const int asked = domain < 0 ? clock.domain : domain;
    const CommandResult result = network.runInClient(
        "pmc -4 -i br0 -b 0 -d " + std::to_string(asked) + " 'GET " + managementId + "'");
    std::map<std::string, std::string> values;
    std::istringstream lines(result.output);
    std::string line;
    const std::string head =
        pmcClockIdentity(clock.identity) + "-" + std::to_string(clock.portNumber) + " seq ";
    bool inAnswer = false;
    while (std::getline(lines, line)) {
        if (line.rfind("\t\t", 0) != 0) {
            // A header line: the answer of this clock to this id, or something else.
            inAnswer = line.find(head) != std::string::npos &&
                       line.find("RESPONSE MANAGEMENT " + managementId + " ") != std::string::npos;
            continue;
        }
        if (inAnswer) {
            std::istringstream words(line);
            std::string name;
            words >> name;
            std::string value;
            std::getline(words >> std::ws, value);
            while (!value.empty() && value.back() == ' ') {
                value.pop_back();
            }
            values[name] = value;
        }
    }
    return values;
}

}  // namespace qvtest
