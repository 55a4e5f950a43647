#include "tests/ptpmgmt/ClientTestSupport.h"

#include <thread>

#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tMessageHeader.h"
#include "tests/support/ptpmgmt/SimulatedClock.h"

using nQVPTP000::tClockIdentity;
using nQVPTP000::tManagementMessage;
using nQVPTP000::tPortIdentity;

namespace qvtest {

tClockIdentity clientIdentity() {
    const std::uint8_t octets[] = {0x02, 0xC1, 0x1E, 0xFF, 0xFE, 0x00, 0x00, 0x07};
    return tClockIdentity(octets);
}

tPortIdentity clientPort() {
    return tPortIdentity(clientIdentity(), kClientPort);
}

tClockIdentity clockIdentity(std::uint8_t last) {
    const std::uint8_t octets[] = {0x00, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, last};
    return tClockIdentity(octets);
}

std::vector<std::uint8_t> answerOctets(std::uint16_t sequenceId, const tPortIdentity& target,
                                       const tPortIdentity& source, std::uint32_t actionField) {
    tStatus status;
    tManagementMessage answer(status);
    answer.setActionField(actionField, status);
    answer.setTargetPortIdentity(target, status);
    answer.setPayload(std::make_unique<nQVPTP000::tNullManagementTLV>(), status);
    answer.getHeader()->setSequenceId(sequenceId, status);
    answer.getHeader()->setSourcePortIdentity(source, status);
    return encodeMessage(answer);
}

std::unique_ptr<tManagementMessage> nullRequest(std::uint32_t actionField) {
    tStatus status;
    auto request = std::make_unique<tManagementMessage>(status);
    request->setActionField(actionField, status);
    request->setPayload(std::make_unique<nQVPTP000::tNullManagementTLV>(), status);
    request->getHeader()->setSourcePortIdentity(clientPort(), status);
    return request;
}

bool discoverAll(nQVPTPMGMT000::tPTPMgmtNode& node, std::uint16_t count, tStatus& status) {
    for (int round = 0; round < 100 && node.clockCount() < count && status.succeeded(); ++round) {
        node.findClocks(20, status);
    }
    return node.clockCount() == count;
}

bool eventually(const std::function<bool()>& condition) {
    const auto deadline = tSteadyClock::now() + std::chrono::seconds(10);
    while (!condition()) {
        if (tSteadyClock::now() > deadline) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    return true;
}

}  // namespace qvtest
