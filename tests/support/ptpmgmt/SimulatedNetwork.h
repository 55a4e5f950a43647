#ifndef QV_TESTS_SUPPORT_PTPMGMT_SIMULATEDNETWORK_H
#define QV_TESTS_SUPPORT_PTPMGMT_SIMULATEDNETWORK_H

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <map>
#include <mutex>
#include <vector>

#include "ptp/transport/iPTPPortMessaging.h"
#include "tests/support/ptpmgmt/SimulatedClock.h"

namespace qvtest {

// A network in memory: every datagram sent goes to the attached simulated clocks at once,
// and their answers wait (each for its delay) for `receive`. No sockets, no privileges.
// A clock may sit on one interface: a send through another does not reach it, and its
// answers come in on its own. A clock attached on two interfaces answers on both.
//
// Like the UDP transport: sending while closed fails with -52003; a receive returns -52008
// while closed, -52009 once after abortReceive (also when the abort came first) and -52003
// for a datagram longer than 1024 octets, which it consumes.
class SimulatedNetwork final : public nQVPTP000::iPTPPortMessaging {
  public:
    using tClock = std::chrono::steady_clock;
    using tIndex = nQVPTP000::tInterfaceIndex;
    static constexpr std::size_t kMaxDatagram = 1024;

    // The clock stays the caller's and must outlive the network's use.
    void attach(SimulatedClock& clock, tIndex on = nQVPTP000::kEveryInterface) {
        std::lock_guard<std::mutex> guard(lock_);
        clocks_.emplace_back(&clock, on);
    }

    void open(tStatus& status) override;
    void close(tStatus&) override {
        open_.store(false);
        wake();
    }
    void sendEventMessage(nQVPTP000::tProtocolDataUnit& u, tStatus& s) override { send(u, s); }
    void sendGeneralMessage(nQVPTP000::tProtocolDataUnit& u, tStatus& s) override { send(u, s); }
    void sendGeneralMessageVia(nQVPTP000::tProtocolDataUnit& u, tIndex via, tStatus& s) override {
        send(u, s, via);
    }
    tIndex getReceiveInterface() const override { return lastInterface_; }
    void receive(nQVPTP000::tProtocolDataUnit& unit, tStatus& status) override;
    void abortReceive(tStatus&) override {
        abortRequested_.store(true);
        wake();
    }
    nQVPTP000::tPortAddress getPortAddress() override { return {}; }

    // Queues a datagram for receive as if it had arrived from the network.
    void inject(std::vector<std::uint8_t> octets,
                std::chrono::milliseconds delay = std::chrono::milliseconds(0));
    // Queues a datagram too long for the transport: the receive that meets it fails with
    // -52003, as the UDP transport's receive does for an oversized datagram.
    void failNextReceive() { inject(std::vector<std::uint8_t>(kMaxDatagram + 1, 0)); }
    // The next `count` sends fail with -52003 after `successes` more have gone out.
    void failSends(std::size_t successes = 0, std::size_t count = 1);
    void failNextSend() { failSends(0, 1); }

    // Every datagram sent successfully, in order.
    std::vector<std::vector<std::uint8_t>> sentDatagrams() const;
    std::size_t sentCount() const { return sentDatagrams().size(); }
    // The interface each of them was sent through (kEveryInterface: all).
    std::vector<tIndex> sentVia() const;
    // Datagrams waiting for receive (delayed answers included).
    std::size_t queuedCount() const;
    bool isOpen() const { return open_.load(); }

  private:
    using tArrival = std::pair<std::vector<std::uint8_t>, tIndex>;

    void send(nQVPTP000::tProtocolDataUnit& unit, tStatus& status,
              tIndex via = nQVPTP000::kEveryInterface);
    void push(tArrival arrival, tClock::time_point due);
    // Waits until the earliest datagram is due and takes it; false once closed or aborted.
    bool pop(tArrival& arrival);
    void wake();

    mutable std::mutex lock_;
    std::condition_variable changed_;
    // Each clock and the interface it sits on; guarded by lock_.
    std::vector<std::pair<SimulatedClock*, tIndex>> clocks_;
    std::vector<std::vector<std::uint8_t>> sent_;            // guarded by lock_
    std::vector<tIndex> sentVia_;                            // guarded by lock_
    std::size_t sendsBeforeFailure_ = 0, failingSends_ = 0;  // guarded by lock_
    // Answers by due time, in arrival order among equal times; guarded by lock_.
    std::multimap<tClock::time_point, tArrival> arrivals_;
    std::atomic<bool> open_{false}, abortRequested_{false};
    tIndex lastInterface_ = nQVPTP000::kEveryInterface;  // the receiving thread's only
};

}  // namespace qvtest

#endif
