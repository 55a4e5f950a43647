#ifndef QV_TESTS_SUPPORT_PTPMGMT_UDPRESPONDER_H
#define QV_TESTS_SUPPORT_PTPMGMT_UDPRESPONDER_H

#include <atomic>
#include <cstdint>
#include <thread>
#include <vector>

#include "ptp/transport/tUDPNetworkInterface.h"
#include "tests/support/ptpmgmt/SimulatedClock.h"
#include "tests/support/ptpmgmt/TimedDatagramQueue.h"

namespace qvtest {

// Simulated clocks answering over real UDP: a UDP interface of its own (multicast group
// 224.0.1.129, ports 319 and 320) in the network namespace of the thread that calls
// `start`, a thread that receives and answers at once, and one that sends the answers that
// are to go out late. Its own answers come back to it by multicast and are ignored, as the
// clocks answer requests only.
class UdpResponder {
  public:
    // The clocks stay the caller's and must outlive the responder.
    explicit UdpResponder(std::vector<SimulatedClock*> clocks);
    ~UdpResponder();
    UdpResponder(const UdpResponder&) = delete;
    UdpResponder& operator=(const UdpResponder&) = delete;

    // Opens the interface and starts the threads (in the calling thread's namespace).
    void start(tStatus& status);
    // Ends both threads and closes the interface; answers not yet sent are dropped.
    void stop();

    std::uint64_t datagramsReceived() const { return received_.load(); }
    std::uint64_t answersSent() const { return sent_.load(); }

  private:
    void receiveLoop();
    void sendLoop();
    void send(std::vector<std::uint8_t>& octets);

    std::vector<SimulatedClock*> clocks_;
    nQVPTP000::tUDPNetworkInterface transport_;
    TimedDatagramQueue late_;
    std::atomic<bool> stopping_{false};
    std::atomic<std::uint64_t> received_{0};
    std::atomic<std::uint64_t> sent_{0};
    std::thread receiver_;
    std::thread sender_;
};

}  // namespace qvtest

#endif
