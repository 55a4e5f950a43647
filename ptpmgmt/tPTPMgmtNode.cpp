#include "ptpmgmt/tPTPMgmtNode.h"

#include <algorithm>
#include <new>
#include <thread>

#include "platform/tStatusReason.h"
#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/tMessageHeader.h"
#include "ptpmgmt/mgmtTrace.h"
#include "ptpmgmt/tPTPClockProxy.h"

namespace nQVPTPMGMT000 {

using nQVPTP000::tManagementMessage;
using nQVPTP000::tManagementMessagePayload;
using nQVTARN000::tMutex;

tPTPMgmtNode::tPTPMgmtNode(nQVPTP000::iPTPPortMessaging* transport,
                           const nQVPTP000::tClockIdentity& clockIdentity, std::uint16_t portNumber,
                           tStatus& status)
    : portIdentity_(clockIdentity, portNumber),
      transceiver_(transport, clockIdentity, portNumber, status) {
    clockListLock_.create(status);
    requestLock_.create(status);
}

tPTPMgmtNode::~tPTPMgmtNode() {
    tStatus status;
    tMutex::tGuard guard(clockListLock_, status);
    clocks_.clear();
    descriptions_.clear();
}

void tPTPMgmtNode::open(tStatus& status) {
    transceiver_.start(status);
}

void tPTPMgmtNode::close(tStatus& status) {
    transceiver_.stop(status);
}

std::unique_ptr<tManagementMessage> tPTPMgmtNode::discoveryRequest(
    const nQVPTP000::tPortIdentity& target, tStatus& status) const {
    auto request = std::make_unique<tManagementMessage>(status);
    request->setActionField(tManagementMessagePayload::kGet, status);
    request->setTargetPortIdentity(target, status);
    request->setPayload(std::make_unique<nQVPTP000::tClockDescriptionTLV>(), status);
    if (nQVPTP000::tMessageHeader* header = request->getHeader()) {
        header->setDomainNumber(0, status);
        header->setSourcePortIdentity(portIdentity_, status);
    }
    return request;
}

void tPTPMgmtNode::findClocks(std::uint16_t timeoutMs, tStatus& status) {
    discover(kDiscoveryDomains, timeoutMs, status);
}

void tPTPMgmtNode::findClocksInDefaultDomain(std::uint16_t timeoutMs, tStatus& status) {
    discover(1, timeoutMs, status);
}

// Memory for the request runs out before anything is sent, if at all: collecting records
// its own failures, so a discovery never leaves requests awaited behind it.
void tPTPMgmtNode::discover(std::uint8_t domains, std::uint16_t timeoutMs, tStatus& status) {
    try {
        sendAndCollect(domains, timeoutMs, status);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
    }
}

// Sends the request in domains 0 .. domains - 1 with consecutive sequence ids, lets the
// receive thread collect answers for `timeoutMs`, then makes a proxy of every new port.
void tPTPMgmtNode::sendAndCollect(std::uint8_t domains, std::uint16_t timeoutMs, tStatus& status) {
    std::unique_ptr<tManagementMessage> request =
        discoveryRequest(nQVPTP000::allOnesPortIdentity(), status);
    tMutex::tGuard clockList(clockListLock_, status);
    const std::vector<std::uint16_t> sent =
        sendInDomains(*request, domains, std::chrono::milliseconds(domains > 1 ? 1 : 0), status);
    if (status.succeeded()) {
        std::this_thread::sleep_for(std::chrono::milliseconds(timeoutMs));
    }
    for (std::uint16_t sequenceId : sent) {
        transceiver_.cancelRequest(sequenceId, status);
        collect(sequenceId, status);
    }
    // A discovery that failed part-way must not leave requests that keep storing answers.
    retire(sent);
}

// The request in domains 0 .. domains - 1 under requestLock_, so that the sequence ids are
// consecutive; the ids of those that went out.
std::vector<std::uint16_t> tPTPMgmtNode::sendInDomains(tManagementMessage& request,
                                                       std::uint8_t domains,
                                                       std::chrono::milliseconds pause,
                                                       tStatus& status) {
    std::vector<std::uint16_t> sent;
    sent.reserve(domains);
    tMutex::tGuard requests(requestLock_, status);
    for (std::uint8_t domain = 0; domain < domains && status.succeeded(); ++domain) {
        request.getHeader()->setDomainNumber(domain, status);
        const std::uint16_t sequenceId = transceiver_.sendRequest(request, status);
        if (status.succeeded()) {
            sent.push_back(sequenceId);
            std::this_thread::sleep_for(pause);
        }
    }
    return sent;
}

void tPTPMgmtNode::retire(const std::vector<std::uint16_t>& sequenceIds) {
    for (std::uint16_t sequenceId : sequenceIds) {
        tStatus scratch;
        transceiver_.retireRequest(sequenceId, scratch);
    }
}

iPTPClockProxy* tPTPMgmtNode::askClock(const tClockKey& key, std::uint16_t timeoutMs,
                                       tStatus& status) {
    try {
        return askAndKeep(key, timeoutMs, status);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
        return nullptr;
    }
}

// No pause between the requests: one port answers in its own domain only. The wait holds
// no lock of the node, so exchanges and other lookups go on meanwhile.
iPTPClockProxy* tPTPMgmtNode::askAndKeep(const tClockKey& key, std::uint16_t timeoutMs,
                                         tStatus& status) {
    std::unique_ptr<tManagementMessage> request = discoveryRequest(portIdentityOf(key), status);
    const std::vector<std::uint16_t> sent =
        sendInDomains(*request, kDiscoveryDomains, std::chrono::milliseconds(0), status);
    std::vector<tAnswer> answers = awaitAnswerOf(key, sent, timeoutMs, status);
    retire(sent);
    tMutex::tGuard clockList(clockListLock_, status);
    for (tAnswer& answer : answers) {
        keep(std::move(answer), status);
    }
    if (status.failed()) {
        return nullptr;  // also when the lock was not taken
    }
    const auto found = clocks_.find(key);
    return found != clocks_.end() ? found->second.get() : nullptr;
}

// Takes the answers to `sequenceIds` as they come, until one is from `key` or the time is
// up; the others (another port that took the request for its own) are kept too.
std::vector<tPTPMgmtNode::tAnswer> tPTPMgmtNode::awaitAnswerOf(
    const tClockKey& key, const std::vector<std::uint16_t>& sequenceIds, std::uint16_t timeoutMs,
    tStatus& status) {
    const auto deadline = tMgmtMsgTransceiver::tClock::now() + std::chrono::milliseconds(timeoutMs);
    std::vector<tAnswer> answers;
    bool answered = false;
    while (status.succeeded() && !sequenceIds.empty()) {
        const std::uint64_t seen = transceiver_.arrivals();
        for (std::uint16_t sequenceId : sequenceIds) {
            tAnswer answer{nullptr, nQVPTP000::kEveryInterface};
            while ((answer.message = transceiver_.takeResponse(sequenceId, answer.arrivedOn,
                                                               status)) != nullptr) {
                answered =
                    answered ||
                    makeClockKey(answer.message->getHeader()->getSourcePortIdentity()) == key;
                answers.push_back(std::move(answer));
            }
        }
        if (answered || tMgmtMsgTransceiver::tClock::now() >= deadline) {
            break;
        }
        transceiver_.awaitArrival(seen, deadline);
    }
    return answers;
}

// Turns the stored answers to one discovery request into proxies (clockListLock_ held).
void tPTPMgmtNode::collect(std::uint16_t sequenceId, tStatus& status) {
    tAnswer answer{nullptr, nQVPTP000::kEveryInterface};
    while ((answer.message = transceiver_.takeResponse(sequenceId, answer.arrivedOn, status))) {
        keep(std::move(answer), status);
    }
}

// Enters one answer (clockListLock_ held). A port already known keeps its proxy, and the
// interface through which it is reached, and now describes itself by the newer answer.
void tPTPMgmtNode::keep(tAnswer answer, tStatus& status) {
    if (status.failed()) {
        return;  // the lock may not be held
    }
    try {
        const tClockKey key = makeClockKey(answer.message->getHeader()->getSourcePortIdentity());
        tDescription description(std::move(answer.message));
        descriptions_[key] = description;
        auto known = clocks_.find(key);
        if (known != clocks_.end()) {
            known->second->setCachedDescription(description);
        } else {
            clocks_.emplace(key, std::make_unique<tPTPClockProxy>(this, key, description,
                                                                  answer.arrivedOn, status));
            clockCount_.store(static_cast<std::uint16_t>(clocks_.size()));
        }
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
    }
}

std::uint16_t tPTPMgmtNode::clockCount() const {
    return clockCount_.load();
}

void tPTPMgmtNode::copyClockProxies(iPTPClockProxy** proxies, std::uint16_t count,
                                    tStatus& status) {
    tMutex::tGuard guard(clockListLock_, status);
    if (status.failed()) {
        return;
    }
    if (count != clocks_.size()) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
        return;
    }
    for (const auto& [key, proxy] : clocks_) {
        *proxies++ = proxy.get();
    }
}

iPTPClockProxy* tPTPMgmtNode::findClock(const tClockKey& key, tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tMutex::tGuard guard(clockListLock_, status);
    auto found = clocks_.find(key);
    if (status.succeeded() && found == clocks_.end()) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
    }
    return status.succeeded() ? found->second.get() : nullptr;
}

// By identity, not by the proxy's key: after assign that key names another port, whose
// proxy must stay.
void tPTPMgmtNode::removeClock(iPTPClockProxy* proxy, tStatus& status) {
    if (status.failed() || proxy == nullptr) {
        return;
    }
    tMutex::tGuard guard(clockListLock_, status);
    auto found = std::find_if(clocks_.begin(), clocks_.end(),
                              [proxy](const auto& entry) { return entry.second.get() == proxy; });
    if (status.succeeded() && found == clocks_.end()) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
    }
    if (status.succeeded()) {
        descriptions_.erase(found->first);
        clocks_.erase(found);
        clockCount_.store(static_cast<std::uint16_t>(clocks_.size()));
    }
}

std::unique_ptr<tManagementMessage> tPTPMgmtNode::sendAndAwait(
    const nQVPTP000::tPortIdentity& target, std::unique_ptr<tManagementMessagePayload> payload,
    std::uint32_t actionField, std::uint16_t timeoutMs, std::uint8_t domainNumber,
    nQVPTP000::tInterfaceIndex via, tStatus& status) {
    tManagementMessage request(status);
    request.setActionField(actionField, status);
    request.setTargetPortIdentity(target, status);
    request.setPayload(std::move(payload), status);
    if (nQVPTP000::tMessageHeader* header = request.getHeader()) {
        header->setDomainNumber(domainNumber, status);
        header->setSourcePortIdentity(portIdentity_, status);
    }
    if (status.failed()) {
        return nullptr;
    }
    std::uint16_t sequenceId = 0;
    {
        tMutex::tGuard requests(requestLock_, status);
        sequenceId = transceiver_.sendRequest(request, via, status);
    }
    if (status.failed()) {
        return nullptr;
    }
    std::unique_ptr<tManagementMessage> answer = await(sequenceId, request, timeoutMs, status);
    tStatus scratch;
    transceiver_.retireRequest(sequenceId, scratch);
    if (tStatusReason::kindOf(status) != tStatusReason::tKind::kNone) {
        traceFailure(request, status);
    }
    return answer;
}

// One line for each exchange that failed for a reason the clock gave or withheld.
void tPTPMgmtNode::traceFailure(const tManagementMessage& request, const tStatus& status) const {
    try {
        tStatus scratch;
        const tManagementMessagePayload* asked = request.getPayload(scratch);
        const std::string reason = tStatusReason::describe(status);
        const nQVPTP000::tPortIdentity target = request.getTargetPortIdentity();
        mgmtTrace()
            .beginLine(kComponentMgmt, __LINE__, sourceBaseName(__FILE__), status.code, 0)
            .appendFormatted("exchange %u, managementId 0x%04X, with ",
                             request.getHeader()->getSequenceId(),
                             asked != nullptr ? asked->getManagementId() : 0U)
            .append(target.getClockIdentity())
            .appendFormatted(":%u failed: %s", target.getPortNumber(), reason.c_str())
            .endLine();
    } catch (const std::bad_alloc&) {
        // The line is a diagnostic: without memory for it the failure stands as recorded.
    }
}

// Waits for the first answer to `sequenceId`: the caller wakes as soon as one is stored,
// and gives up once ceil(timeoutMs / 50) steps of 50 ms have passed without one.
std::unique_ptr<tManagementMessage> tPTPMgmtNode::await(std::uint16_t sequenceId,
                                                        const tManagementMessage& request,
                                                        std::uint16_t timeoutMs, tStatus& status) {
    if (timeoutMs == 0) {
        if (QV_STATUS_SET(status, kStatusNoData, kComponentMgmt)) {
            tStatusReason::noAnswer(status, 0);
        }
        return nullptr;
    }
    const std::uint32_t steps = (timeoutMs + kPollMilliseconds - 1) / kPollMilliseconds;
    const auto deadline =
        tMgmtMsgTransceiver::tClock::now() + std::chrono::milliseconds(steps * kPollMilliseconds);
    while (status.succeeded()) {
        const std::uint64_t seen = transceiver_.arrivals();
        std::unique_ptr<tManagementMessage> answer = transceiver_.takeResponse(sequenceId, status);
        if (answer) {
            check(request, answer, status);
            return answer;
        }
        if (status.succeeded() && tMgmtMsgTransceiver::tClock::now() >= deadline &&
            QV_STATUS_SET(status, kStatusNoData, kComponentMgmt)) {
            tStatusReason::noAnswer(status, timeoutMs);
        }
        if (status.succeeded()) {
            transceiver_.awaitArrival(seen, deadline);
        }
    }
    return nullptr;
}

// Judges the first answer; one that fails a check is dropped with -52012.
void tPTPMgmtNode::check(const tManagementMessage& request,
                         std::unique_ptr<tManagementMessage>& answer, tStatus& status) {
    const tManagementMessagePayload* payload = answer->getPayload(status);
    const tManagementMessagePayload* asked = request.getPayload(status);
    if (status.failed() || payload == nullptr || asked == nullptr) {
        answer.reset();
        return;
    }
    const std::uint32_t action = request.getActionField();
    const std::uint32_t reply = answer->getActionField();
    const bool pairMatches =
        ((action == tManagementMessagePayload::kGet || action == tManagementMessagePayload::kSet) &&
         reply == tManagementMessagePayload::kResponse) ||
        (action == tManagementMessagePayload::kCommand &&
         reply == tManagementMessagePayload::kAcknowledge);
    if (payload->getTlvType() == nQVPTP000::tTLV::kManagementErrorStatus) {
        if (QV_STATUS_SET(status, kStatusNoData, kComponentMgmt)) {
            // The clock's own words: they stay with the status after the answer is gone.
            const auto* refusal =
                dynamic_cast<const nQVPTP000::tManagementErrorStatusTLV*>(payload);
            tStatusReason::refused(
                status, refusal != nullptr ? refusal->getManagementErrorId() : 0,
                refusal != nullptr ? refusal->getDisplayData().view() : std::string_view());
        }
        answer.reset();
    } else if (!pairMatches || payload->getManagementId() != asked->getManagementId()) {
        if (QV_STATUS_SET(status, kStatusNoData, kComponentMgmt)) {
            tStatusReason::wrongAnswer(status, reply, payload->getManagementId());
        }
        answer.reset();
    }
}

}  // namespace nQVPTPMGMT000
