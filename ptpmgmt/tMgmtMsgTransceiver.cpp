#include "ptpmgmt/tMgmtMsgTransceiver.h"

#include <algorithm>
#include <new>
#include <thread>

#include "platform/tStatusReason.h"
#include "ptp/tMessageHeader.h"
#include "ptp/tPTPMessageFactory.h"
#include "ptp/tProtocolDataUnit.h"

namespace nQVPTPMGMT000 {

using nQVPTP000::tManagementMessage;
using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tProtocolDataUnit;
using nQVPTP000::tPTPMessage;

namespace {

constexpr std::uint32_t kManagementMessageType = 13;
// After a failure of the socket itself the loop pauses this long, so that a failure that
// repeats at once (a closed socket) does not spin the processor. A bad datagram earns no
// pause: pausing for each would let a flood of them pile up in the socket's queue ahead of
// the answers.
constexpr auto kErrorBackOff = std::chrono::milliseconds(10);

}  // namespace

tMgmtMsgTransceiver::tMgmtMsgTransceiver(nQVPTP000::iPTPPortMessaging* transport,
                                         const nQVPTP000::tClockIdentity& clockIdentity,
                                         std::uint16_t portNumber, tStatus& status)
    : transport_(transport), localPortIdentity_(clockIdentity, portNumber) {
    sendLock_.create(status);
    responsesLock_.create(status);
    pendingLock_.create(status);
    ready_ = status.succeeded();
}

tMgmtMsgTransceiver::~tMgmtMsgTransceiver() {
    if (running_.load() && !stopRequested_.load()) {
        tStatus status;
        stop(status);
    }
}

void tMgmtMsgTransceiver::start(tStatus& status) {
    if (!ready_ || running_.load()) {
        return;
    }
    stopRequested_.store(false);
    transport_->open(status);
    if (status.failed()) {
        tStatus scratch;
        transport_->close(scratch);
        return;
    }
    running_.store(true);
    threadStatus_.reset();
    threadController_.start(this, threadStatus_);
    if (threadStatus_.failed()) {
        // Without its receive thread the transceiver would look started but never deliver
        // an answer: the caller learns of the failure, and the transport is closed again.
        status.merge(threadStatus_);
        running_.store(false);
        tStatus scratch;
        transport_->close(scratch);
    }
}

void tMgmtMsgTransceiver::stop(tStatus& status) {
    bool running = true;
    if (!running_.compare_exchange_strong(running, false)) {
        return;  // not running, or another thread is stopping it
    }
    stopRequested_.store(true);
    tStatus scratch;
    transport_->abortReceive(scratch);
    status.merge(scratch);
    scratch.reset();
    {
        // A send in progress finishes before its socket is closed, and none starts after:
        // a descriptor closed under sendto may already belong to another part of the process.
        nQVTARN000::tMutex::tGuard sending(sendLock_, scratch);
        transport_->close(scratch);
    }
    status.merge(scratch);
    threadController_.join();
}

std::uint16_t tMgmtMsgTransceiver::sendRequest(tManagementMessage& message,
                                               nQVPTP000::tInterfaceIndex via, tStatus& status) {
    if (!running_.load()) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
        return 0;
    }
    if (stopRequested_.load() || status.failed()) {
        return 0;
    }
    nQVTARN000::tMutex::tGuard sending(sendLock_, status);
    if (stopRequested_.load()) {
        return 0;  // stop came while this caller waited for the lock: the transport is closing
    }
    const auto sequenceId = static_cast<std::uint16_t>(nextSequenceId_);
    nQVPTP000::tMessageHeader* header = message.getHeader();
    if (header != nullptr) {
        header->setSequenceId(sequenceId, status);
    }
    if (status.succeeded()) {
        ++nextSequenceId_;
        // Awaited before it goes out: a clock may answer before sendGeneralMessage returns,
        // and the receive thread must not drop that answer as unasked for.
        {
            nQVTARN000::tMutex::tGuard pending(pendingLock_, status);
            if (status.succeeded()) {
                try {
                    pendingSequenceIds_.push_back(sequenceId);
                } catch (const std::bad_alloc&) {
                    QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
                }
            }
        }
        tProtocolDataUnit unit(status);
        message.serialize(unit, status);
        transport_->sendGeneralMessageVia(unit, via, status);
        if (status.failed()) {
            tStatus scratch;
            cancelRequest(sequenceId, scratch);
        }
    }
    return sequenceId;
}

std::unique_ptr<tManagementMessage> tMgmtMsgTransceiver::takeResponse(
    std::uint16_t sequenceId, nQVPTP000::tInterfaceIndex& arrivedOn, tStatus& status) {
    nQVTARN000::tMutex::tGuard guard(responsesLock_, status);
    if (status.failed()) {
        return nullptr;
    }
    auto found = responses_.lower_bound(sequenceId);
    if (found == responses_.end() || found->first != sequenceId) {
        return nullptr;
    }
    std::unique_ptr<tManagementMessage> message = std::move(found->second.message);
    arrivedOn = found->second.arrivedOn;
    responses_.erase(found);
    return message;
}

void tMgmtMsgTransceiver::cancelRequest(std::uint16_t sequenceId, tStatus& status) {
    forget(sequenceId, false, status);
}

void tMgmtMsgTransceiver::retireRequest(std::uint16_t sequenceId, tStatus& status) {
    forget(sequenceId, true, status);
}

void tMgmtMsgTransceiver::forget(std::uint16_t sequenceId, bool storedToo, tStatus& status) {
    if (status.failed()) {
        return;
    }
    // Under pendingLock_ the receive thread cannot be between matching an answer to this id
    // and storing it, so nothing for it can be stored after this.
    nQVTARN000::tMutex::tGuard pending(pendingLock_, status);
    if (status.failed()) {
        return;
    }
    std::erase(pendingSequenceIds_, sequenceId);
    if (storedToo) {
        nQVTARN000::tMutex::tGuard responses(responsesLock_, status);
        if (status.succeeded()) {
            responses_.erase(sequenceId);
        }
    }
}

std::uint64_t tMgmtMsgTransceiver::arrivals() const {
    std::lock_guard<std::mutex> guard(arrivalLock_);
    return arrivals_;
}

void tMgmtMsgTransceiver::awaitArrival(std::uint64_t seen, tClock::time_point deadline) const {
    std::unique_lock<std::mutex> guard(arrivalLock_);
    arrived_.wait_until(guard, deadline, [&] { return arrivals_ != seen; });
}

std::size_t tMgmtMsgTransceiver::storedResponseCount() const {
    tStatus status;
    nQVTARN000::tMutex::tGuard guard(responsesLock_, status);
    return responses_.size();
}

tStatus tMgmtMsgTransceiver::lastReceiveError() const {
    std::lock_guard<std::mutex> guard(receiveErrorLock_);
    return lastReceiveError_;
}

// Takes messages of this node's requests only: a management answer (RESPONSE or
// ACKNOWLEDGE) to a pending sequence id, addressed exactly to this client's port.
bool tMgmtMsgTransceiver::matches(const tPTPMessage& message, tStatus& status) const {
    const nQVPTP000::tMessageHeader* header = message.getHeader();
    if (header == nullptr || header->getMessageType() != kManagementMessageType) {
        return false;
    }
    const auto& management = static_cast<const tManagementMessage&>(message);
    const std::uint16_t sequenceId = header->getSequenceId();
    const bool pending = std::find(pendingSequenceIds_.begin(), pendingSequenceIds_.end(),
                                   sequenceId) != pendingSequenceIds_.end();
    const std::uint32_t action = management.getActionField();
    return status.succeeded() && pending &&
           management.getTargetPortIdentity() == localPortIdentity_ &&
           (action == tManagementMessagePayload::kResponse ||
            action == tManagementMessagePayload::kAcknowledge);
}

// Matches and stores under pendingLock_, so that retireRequest sees either no answer or
// a stored one, never one in between.
void tMgmtMsgTransceiver::store(tResponse response, tStatus& status) {
    nQVTARN000::tMutex::tGuard pending(pendingLock_, status);
    if (!matches(*response.message, status)) {
        return;
    }
    {
        nQVTARN000::tMutex::tGuard responses(responsesLock_, status);
        if (status.failed()) {
            return;
        }
        const std::uint16_t sequenceId = response.message->getHeader()->getSequenceId();
        try {
            responses_.emplace(sequenceId, std::move(response));
        } catch (const std::bad_alloc&) {
            return;  // lost like a dropped datagram: its exchange times out
        }
    }
    {
        std::lock_guard<std::mutex> guard(arrivalLock_);
        ++arrivals_;
    }
    arrived_.notify_all();
}

void tMgmtMsgTransceiver::noteReceiveError(tStatus& threadStatus) {
    receiveErrors_.fetch_add(1);
    {
        std::lock_guard<std::mutex> guard(receiveErrorLock_);
        lastReceiveError_ = threadStatus;
    }
    threadStatus.reset();
    std::this_thread::sleep_for(kErrorBackOff);
}

void tMgmtMsgTransceiver::run(tStatus& status) {
    tProtocolDataUnit unit(status);
    while (!stopRequested_.load() && status.succeeded()) {
        unit.reset();
        transport_->receive(unit, status);
        if (status.failed()) {
            if (tStatusReason::kindOf(status) == tStatusReason::tKind::kBadDatagram) {
                badDatagrams_.fetch_add(1);
                status.reset();
            } else if (!stopRequested_.load()) {
                noteReceiveError(status);
            }
            continue;
        }
        tStatus decodeStatus;
        std::unique_ptr<tPTPMessage> message =
            nQVPTP000::tPTPMessageFactory::createMessage(unit, decodeStatus);
        if (decodeStatus.failed() || !message) {
            badDatagrams_.fetch_add(1);
            continue;
        }
        const nQVPTP000::tMessageHeader* header = message->getHeader();
        if (header == nullptr || header->getMessageType() != kManagementMessageType) {
            continue;
        }
        std::unique_ptr<tManagementMessage> management(
            static_cast<tManagementMessage*>(message.release()));
        store({std::move(management), transport_->getReceiveInterface()}, status);
    }
}

}  // namespace nQVPTPMGMT000
