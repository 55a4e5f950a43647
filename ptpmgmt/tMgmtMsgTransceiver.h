#ifndef QV_PTPMGMT_TMGMTMSGTRANSCEIVER_H
#define QV_PTPMGMT_TMGMTMSGTRANSCEIVER_H

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <vector>

#include "platform/iThread.h"
#include "platform/tMutex.h"
#include "platform/tThreadController.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tPortIdentity.h"
#include "ptp/transport/iPTPPortMessaging.h"

namespace nQVPTPMGMT000 {

// The message pump of the management client: gives each request the next sequence id,
// encodes it and sends it to the general port; on a receive thread of its own it decodes
// every datagram and keeps the management answers to its outstanding requests until their
// callers take them.
//
// Locks: sendLock_ may be held while pendingLock_ is taken; pendingLock_ may be held while
// responsesLock_ is taken; never the other way round. arrivalLock_ is taken alone.
class tMgmtMsgTransceiver final : public nQVTARN000::iThread {
  public:
    using tClock = std::chrono::steady_clock;

    tMgmtMsgTransceiver(nQVPTP000::iPTPPortMessaging* transport,
                        const nQVPTP000::tClockIdentity& clockIdentity, std::uint16_t portNumber,
                        tStatus& status);
    ~tMgmtMsgTransceiver() override;
    tMgmtMsgTransceiver(const tMgmtMsgTransceiver&) = delete;
    tMgmtMsgTransceiver& operator=(const tMgmtMsgTransceiver&) = delete;

    // Opens the transport and starts the receive thread.
    void start(tStatus& status);
    // Ends the receive thread (returns only once it has ended) and closes the transport.
    void stop(tStatus& status);

    // Gives `message` the next sequence id, encodes and sends it; returns that id (also when
    // sending failed: the caller tests the status). The message stays the caller's.
    std::uint16_t sendRequest(nQVPTP000::tManagementMessage& message, tStatus& status) {
        return sendRequest(message, nQVPTP000::kEveryInterface, status);
    }
    // The same through one interface of the transport (see iPTPPortMessaging).
    std::uint16_t sendRequest(nQVPTP000::tManagementMessage& message,
                              nQVPTP000::tInterfaceIndex via, tStatus& status);
    // The earliest stored answer with that sequence id, now owned by the caller, or null.
    std::unique_ptr<nQVPTP000::tManagementMessage> takeResponse(std::uint16_t sequenceId,
                                                                tStatus& status) {
        nQVPTP000::tInterfaceIndex unused = nQVPTP000::kEveryInterface;
        return takeResponse(sequenceId, unused, status);
    }
    // The same, and the interface on which it came in.
    std::unique_ptr<nQVPTP000::tManagementMessage> takeResponse(
        std::uint16_t sequenceId, nQVPTP000::tInterfaceIndex& arrivedOn, tStatus& status);
    // Later answers to that sequence id are dropped on arrival; stored ones stay.
    void cancelRequest(std::uint16_t sequenceId, tStatus& status);
    // Cancels and drops the answers already stored, so that late answers to a request whose
    // caller has finished do not pile up for the life of the transceiver.
    void retireRequest(std::uint16_t sequenceId, tStatus& status);

    // Counts the answers stored so far; pass it to awaitArrival to sleep until the next one.
    std::uint64_t arrivals() const;
    // Sleeps until an answer is stored after `seen` was read, or until `deadline`.
    void awaitArrival(std::uint64_t seen, tClock::time_point deadline) const;

    // The receive loop (on the receive thread).
    void run(tStatus& status) override;

    // Transport errors met by the receive loop: the loop counts them, keeps the last one
    // here and carries on delivering answers.
    std::uint64_t receiveErrorCount() const { return receiveErrors_.load(); }
    tStatus lastReceiveError() const;
    // Datagrams dropped as too large or undecodable: counted, not paused for.
    std::uint64_t badDatagramCount() const { return badDatagrams_.load(); }
    bool isRunning() const { return running_.load(); }
    // Answers stored and not yet taken (for tests that watch the store stay bounded).
    std::size_t storedResponseCount() const;

  private:
    bool matches(const nQVPTP000::tPTPMessage& message, tStatus& status) const;
    struct tResponse {
        std::unique_ptr<nQVPTP000::tManagementMessage> message;
        nQVPTP000::tInterfaceIndex arrivedOn;
    };

    void store(tResponse response, tStatus& status);
    void noteReceiveError(tStatus& threadStatus);
    // Drops the id from the awaited ones and, when `storedToo`, its stored answers.
    void forget(std::uint16_t sequenceId, bool storedToo, tStatus& status);

    std::uint32_t nextSequenceId_ = 0;         // guarded by sendLock_
    nQVPTP000::iPTPPortMessaging* transport_;  // not owned
    const nQVPTP000::tPortIdentity localPortIdentity_;
    bool ready_ = false;
    std::atomic<bool> running_{false};
    std::atomic<bool> stopRequested_{false};
    nQVTARN000::tThreadController threadController_;
    nQVTARN000::tMutex sendLock_;
    tStatus threadStatus_;
    // Answers not yet taken, in arrival order per sequence id; guarded by responsesLock_.
    std::multimap<std::uint16_t, tResponse> responses_;
    std::vector<std::uint16_t> pendingSequenceIds_;  // guarded by pendingLock_
    mutable nQVTARN000::tMutex responsesLock_;
    nQVTARN000::tMutex pendingLock_;

    mutable std::mutex arrivalLock_;
    mutable std::condition_variable arrived_;
    std::uint64_t arrivals_ = 0;  // guarded by arrivalLock_

    std::atomic<std::uint64_t> receiveErrors_{0};
    std::atomic<std::uint64_t> badDatagrams_{0};
    mutable std::mutex receiveErrorLock_;
    tStatus lastReceiveError_;  // guarded by receiveErrorLock_
};

}  // namespace nQVPTPMGMT000

#endif
