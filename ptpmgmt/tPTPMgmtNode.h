#ifndef QV_PTPMGMT_TPTPMGMTNODE_H
#define QV_PTPMGMT_TPTPMGMTNODE_H

#include <atomic>
#include <chrono>
#include <cstdint>
#include <map>
#include <memory>
#include <vector>

#include "platform/tMutex.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tManagementMessagePayload.h"
#include "ptpmgmt/iPTPMgmtNode.h"
#include "ptpmgmt/tMgmtMsgTransceiver.h"

namespace nQVPTPMGMT000 {

class tPTPClockProxy;

// The management node: finds the clocks on the network with a multicast GET of
// CLOCK_DESCRIPTION, keeps one proxy per answering port, and carries out every
// request/response exchange that a proxy asks for.
//
// Lock order: clockListLock_, then requestLock_, then the transceiver's locks. askClock
// sends under requestLock_ alone and takes clockListLock_ only once its wait is over.
class tPTPMgmtNode final : public iPTPMgmtNode {
  public:
    static constexpr std::uint8_t kDiscoveryDomains = 4;
    static constexpr std::uint32_t kPollMilliseconds = 50;

    tPTPMgmtNode(nQVPTP000::iPTPPortMessaging* transport,
                 const nQVPTP000::tClockIdentity& clockIdentity, std::uint16_t portNumber,
                 tStatus& status);
    ~tPTPMgmtNode() override;
    tPTPMgmtNode(const tPTPMgmtNode&) = delete;
    tPTPMgmtNode& operator=(const tPTPMgmtNode&) = delete;

    // Discovery in domains 0 to 3: four requests, then `timeoutMs` of collecting answers.
    // A port that answers on several interfaces is one clock, reached through the interface
    // of its first answer.
    void findClocks(std::uint16_t timeoutMs, tStatus& status);
    // Asks one port, as discovery asks all: the GET of CLOCK_DESCRIPTION addressed to `key`
    // in domains 0 to 3, on every interface. Returns its proxy as soon as it has answered
    // (a new port is kept as discovery keeps it, beside the clocks known), or null without
    // an error when it did not answer within `timeoutMs`.
    iPTPClockProxy* askClock(const tClockKey& key, std::uint16_t timeoutMs, tStatus& status);
    void findClocksInDefaultDomain(std::uint16_t timeoutMs, tStatus& status) override;
    std::uint16_t clockCount() const override;
    void copyClockProxies(iPTPClockProxy** proxies, std::uint16_t count, tStatus& status) override;
    iPTPClockProxy* findClock(const tClockKey& key, tStatus& status) override;
    void removeClock(iPTPClockProxy* proxy, tStatus& status) override;
    void open(tStatus& status) override;
    void close(tStatus& status) override;

    // One checked exchange: sends `payload` (now owned by the request) with `actionField` to
    // `target` in `domainNumber` through the interface `via` (kEveryInterface: every one)
    // and returns the answer, owned by the caller, once it has
    // passed the checks: no error status, RESPONSE to GET or SET and ACKNOWLEDGE to COMMAND,
    // the same management id. Fails with -52012 when no answer came within the time-out
    // (ceil(timeoutMs / 50) steps of 50 ms) or the answer failed a check; the status's
    // extension words then say which (tStatusReason), and a trace line says it too.
    std::unique_ptr<nQVPTP000::tManagementMessage> sendAndAwait(
        const nQVPTP000::tPortIdentity& target,
        std::unique_ptr<nQVPTP000::tManagementMessagePayload> payload, std::uint32_t actionField,
        std::uint16_t timeoutMs, std::uint8_t domainNumber, nQVPTP000::tInterfaceIndex via,
        tStatus& status);

    const nQVPTP000::tPortIdentity& getPortIdentity() const { return portIdentity_; }
    const tMgmtMsgTransceiver& getTransceiver() const { return transceiver_; }

  private:
    using tDescription = std::shared_ptr<nQVPTP000::tManagementMessage>;
    // A discovery answer and the interface it came in on.
    struct tAnswer {
        std::unique_ptr<nQVPTP000::tManagementMessage> message;
        nQVPTP000::tInterfaceIndex arrivedOn;
    };

    std::unique_ptr<nQVPTP000::tManagementMessage> discoveryRequest(
        const nQVPTP000::tPortIdentity& target, tStatus& status) const;
    void discover(std::uint8_t domains, std::uint16_t timeoutMs, tStatus& status);
    void sendAndCollect(std::uint8_t domains, std::uint16_t timeoutMs, tStatus& status);
    std::vector<std::uint16_t> sendInDomains(nQVPTP000::tManagementMessage& request,
                                             std::uint8_t domains, std::chrono::milliseconds pause,
                                             tStatus& status);
    iPTPClockProxy* askAndKeep(const tClockKey& key, std::uint16_t timeoutMs, tStatus& status);
    std::vector<tAnswer> awaitAnswerOf(const tClockKey& key,
                                       const std::vector<std::uint16_t>& sequenceIds,
                                       std::uint16_t timeoutMs, tStatus& status);
    void retire(const std::vector<std::uint16_t>& sequenceIds);
    void collect(std::uint16_t sequenceId, tStatus& status);
    void keep(tAnswer answer, tStatus& status);
    std::unique_ptr<nQVPTP000::tManagementMessage> await(
        std::uint16_t sequenceId, const nQVPTP000::tManagementMessage& request,
        std::uint16_t timeoutMs, tStatus& status);
    void check(const nQVPTP000::tManagementMessage& request,
               std::unique_ptr<nQVPTP000::tManagementMessage>& response, tStatus& status);
    void traceFailure(const nQVPTP000::tManagementMessage& request, const tStatus& status) const;

    const nQVPTP000::tPortIdentity portIdentity_;
    nQVTARN000::tMutex clockListLock_;
    tMgmtMsgTransceiver transceiver_;
    nQVTARN000::tMutex requestLock_;
    std::map<tClockKey, std::unique_ptr<tPTPClockProxy>> clocks_;  // guarded by clockListLock_
    std::map<tClockKey, tDescription> descriptions_;               // guarded by clockListLock_
    std::atomic<std::uint16_t> clockCount_{0};  // clocks_.size(), readable without the lock
};

}  // namespace nQVPTPMGMT000

#endif
