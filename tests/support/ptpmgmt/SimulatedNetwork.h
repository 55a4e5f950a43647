#ifndef QV_TESTS_SUPPORT_PTPMGMT_SIMULATEDNETWORK_H
#define QV_TESTS_SUPPORT_PTPMGMT_SIMULATEDNETWORK_H

#include <atomic>
#include <chrono>
#include <cstdint>
#include <mutex>
#include <vector>

#include "ptp/transport/iPTPPortMessaging.h"
#include "tests/support/ptpmgmt/SimulatedClock.h"
#include "tests/support/ptpmgmt/TimedDatagramQueue.h"

namespace qvtest {

// A network in memory: every datagram sent goes to the attached simulated clocks at once,
// and their answers wait (each for its delay) for `receive`. No sockets, no privileges.
//
// Like the UDP transport: sending while closed fails with -52003; a receive returns -52008
// while closed, -52009 once after abortReceive (also when the abort came first) and -52003
// for a datagram longer than 1024 octets, which it consumes.
class SimulatedNetwork final : public nQVPTP000::iPTPPortMessaging {
  public:
    static constexpr std::size_t kMaxDatagram = 1024;

    // The clock stays the caller's and must outlive the network's use.
    void attach(SimulatedClock& clock);

    void open(tStatus& status) override;
    void close(tStatus& status) override;
    void sendEventMessage(nQVPTP000::tProtocolDataUnit& unit, tStatus& status) override;
    void sendGeneralMessage(nQVPTP000::tProtocolDataUnit& unit, tStatus& status) override;
    void receive(nQVPTP000::tProtocolDataUnit& unit, tStatus& status) override;
    void abortReceive(tStatus& status) override;
    nQVPTP000::tPortAddress getPortAddress() override { return {}; }

    // Queues a datagram for receive as if it had arrived from the network.
    void inject(std::vector<std::uint8_t> octets,
                std::chrono::milliseconds delay = std::chrono::milliseconds(0));
    // Queues a datagram too long for the transport: the receive that meets it fails with
    // -52003, as the UDP transport's receive does for an oversized datagram.
    void failNextReceive();
    // The next send fails with -52003 and reaches no clock.
    void failNextSend();

    // Every datagram sent successfully, in order.
    std::vector<std::vector<std::uint8_t>> sentDatagrams() const;
    std::size_t sentCount() const;
    // Datagrams waiting for receive (delayed answers included).
    std::size_t queuedCount() const { return arrivals_.size(); }
    bool isOpen() const { return open_.load(); }

  private:
    void send(nQVPTP000::tProtocolDataUnit& unit, tStatus& status);

    mutable std::mutex lock_;
    std::vector<SimulatedClock*> clocks_;          // guarded by lock_
    std::vector<std::vector<std::uint8_t>> sent_;  // guarded by lock_
    bool failNextSend_ = false;                    // guarded by lock_
    std::atomic<bool> open_{false};
    std::atomic<bool> abortRequested_{false};
    TimedDatagramQueue arrivals_;
};

}  // namespace qvtest

#endif
