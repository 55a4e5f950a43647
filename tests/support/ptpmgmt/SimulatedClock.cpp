#include "tests/support/ptpmgmt/SimulatedClock.h"

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/tMessageHeader.h"
#include "ptp/tPTPMessageFactory.h"
#include "ptp/tProtocolDataUnit.h"

using nQVPTP000::tManagementMessage;
using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tMessageHeader;
using nQVPTP000::tPortIdentity;
using nQVPTP000::tProtocolDataUnit;

namespace qvtest {

// Octets kept of an answer sent as garbage: the header and part of the body.
constexpr std::size_t kGarbageLength = 40;

std::vector<std::uint8_t> encodeMessage(const nQVPTP000::tPTPMessage& message) {
    tStatus status;
    tProtocolDataUnit unit(status);
    message.serialize(unit, status);
    const std::size_t length = status.failed() ? 0 : static_cast<std::size_t>(unit.getLength());
    return {unit.getBuffer(), unit.getBuffer() + length};
}

std::unique_ptr<tManagementMessage> decodeManagement(const std::vector<std::uint8_t>& octets) {
    tStatus status;
    tProtocolDataUnit unit(status);
    unit.writeOctets(octets.data(), octets.size(), status);
    auto message = nQVPTP000::tPTPMessageFactory::createMessage(unit, status);
    if (dynamic_cast<tManagementMessage*>(message.get()) == nullptr) {
        return nullptr;
    }
    return std::unique_ptr<tManagementMessage>(static_cast<tManagementMessage*>(message.release()));
}

SimulatedClock::SimulatedClock(const nQVPTP000::tClockIdentity& identity, std::uint16_t numberPorts,
                               std::uint8_t domainNumber)
    : identity_(identity), numberPorts_(numberPorts), managed_(numberPorts, identity) {
    managed_.defaultDataSet.domainNumber = domainNumber;
}

std::vector<SimulatedAnswer> SimulatedClock::answer(const std::uint8_t* octets,
                                                    std::size_t length) {
    std::unique_ptr<tManagementMessage> request =
        decodeManagement(std::vector<std::uint8_t>(octets, octets + length));
    std::vector<SimulatedAnswer> answers;
    std::lock_guard<std::mutex> guard(lock_);
    if (!request || !addressedToUs(*request)) {
        return answers;
    }
    if (fault_ == Fault::silent) {
        return answers;
    }
    const std::uint16_t target = request->getTargetPortIdentity().getPortNumber();
    const bool all = target == tPortIdentity::kAllPorts;
    for (std::uint16_t port = all ? 1 : target; port <= (all ? numberPorts_ : target); ++port) {
        answerAsPort(*request, port, answers);
    }
    return answers;
}

// A GET, SET or COMMAND in the clock's domain, to the clock (or all clocks) and to one of
// its ports (or all ports).
bool SimulatedClock::addressedToUs(const tManagementMessage& request) const {
    const std::uint32_t action = request.getActionField();
    const tPortIdentity target = request.getTargetPortIdentity();
    const std::uint16_t port = target.getPortNumber();
    return action != tManagementMessagePayload::kResponse &&
           action <= tManagementMessagePayload::kCommand &&
           request.getHeader()->getDomainNumber() == managed_.defaultDataSet.domainNumber &&
           (target.getClockIdentity() == identity_ ||
            target.getClockIdentity() == nQVPTP000::allOnesClockIdentity()) &&
           (port == tPortIdentity::kAllPorts || (port >= 1 && port <= numberPorts_));
}

std::unique_ptr<tManagementMessagePayload> SimulatedClock::payloadFor(tManagementMessage& request,
                                                                      std::uint16_t port,
                                                                      tStatus& status) {
    tManagementMessagePayload* asked = request.getPayload(status);
    if (asked == nullptr) {
        return nullptr;
    }
    const std::uint16_t managementId = asked->getManagementId();
    if (refused_ == managementId) {
        return std::make_unique<nQVPTP000::tManagementErrorStatusTLV>(
            managementId, nQVPTP000::tManagementErrorStatusTLV::kNotSupported, "");
    }
    switch (fault_) {
        case Fault::errorStatus:
            return std::make_unique<nQVPTP000::tManagementErrorStatusTLV>(
                managementId, nQVPTP000::tManagementErrorStatusTLV::kGeneralError,
                "simulated failure");
        case Fault::wrongManagementId:
            if (managementId == 0x0000) {
                return std::make_unique<nQVPTP000::tPriority1TLV>();
            }
            return std::make_unique<nQVPTP000::tNullManagementTLV>();
        default:
            return asked->respond(request.getActionField(), managed_, port, status);
    }
}

void SimulatedClock::answerAsPort(tManagementMessage& request, std::uint16_t port,
                                  std::vector<SimulatedAnswer>& answers) {
    tStatus status;
    std::unique_ptr<tManagementMessagePayload> payload = payloadFor(request, port, status);
    tManagementMessage reply(status);
    const bool command = request.getActionField() == tManagementMessagePayload::kCommand;
    reply.setActionField(command != (fault_ == Fault::wrongAction)
                             ? tManagementMessagePayload::kAcknowledge
                             : tManagementMessagePayload::kResponse,
                         status);
    tPortIdentity target = request.getHeader()->getSourcePortIdentity();
    if (fault_ == Fault::wrongTargetPort) {
        target = tPortIdentity(target.getClockIdentity(),
                               static_cast<std::uint16_t>(target.getPortNumber() + 1));
    }
    reply.setTargetPortIdentity(target, status);
    reply.setPayload(std::move(payload), status);
    tMessageHeader* header = reply.getHeader();
    header->setDomainNumber(request.getHeader()->getDomainNumber(), status);
    header->setSequenceId(request.getHeader()->getSequenceId(), status);
    header->setSourcePortIdentity(tPortIdentity(identity_, port), status);
    if (status.failed()) {
        return;
    }
    SimulatedAnswer answer{encodeMessage(reply), delay_};
    if (fault_ == Fault::garbage) {
        answer.octets.resize(std::min(answer.octets.size(), kGarbageLength));
    }
    if (fault_ == Fault::twice) {
        answers.push_back(answer);
    }
    answers.push_back(std::move(answer));
}

}  // namespace qvtest
