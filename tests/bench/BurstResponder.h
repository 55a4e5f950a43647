#ifndef QV_TESTS_BENCH_BURSTRESPONDER_H
#define QV_TESTS_BENCH_BURSTRESPONDER_H

#include <array>
#include <atomic>
#include <cstdint>
#include <map>
#include <string>
#include <thread>
#include <vector>

namespace qvtest {

// Many clock ports answering a discovery at once, over real UDP from a network namespace
// of their own: for the scale benchmark of the management client (tools/bench-client, which
// CI runs: the benchmark fails when a port is not found).
//
// Clock c (0 .. clocks-1) has identity 02 5C 00 FF FE 00 c(high) c(low), ports 1 .. ports,
// and lives in domain c % 4. A GET CLOCK_DESCRIPTION to all clocks and ports in domain d is
// answered by every port of every clock of that domain, as a burst, each answer the clock
// description that ptp4l sent (tests/data/corpus) with the answering port's identity, the
// request's sequence id and domain, addressed to the requester. With `answerReads`, a GET
// of a dataset addressed to one of its ports in that clock's domain is answered too, with
// ptp4l's own answer to it (TIME and UTC_PROPERTIES: ptp4l's refusal). Nothing else is
// answered.
class BurstResponder {
  public:
    BurstResponder(std::string nameSpace, std::uint16_t clocks, std::uint16_t ports,
                   bool answerReads = false);
    ~BurstResponder();
    BurstResponder(const BurstResponder&) = delete;
    BurstResponder& operator=(const BurstResponder&) = delete;

    // Starts the answering thread in the namespace; false with `failure` set when it could
    // not listen there.
    bool start(std::string& failure);
    void stop();

    static std::array<std::uint8_t, 8> identityOf(std::uint16_t clock);
    std::uint64_t answersSent() const { return sent_.load(); }
    // CPU time of the answering thread so far, seconds: to tell it from the client's.
    double cpuSeconds() const;

  private:
    void run();
    void answer(const std::uint8_t* request, std::size_t length);
    void answerRead(const std::uint8_t* request, std::size_t length);
    void send(std::vector<std::uint8_t>& reply, const std::uint8_t* request);

    const std::string nameSpace_;
    const std::uint16_t clocks_;
    const std::uint16_t ports_;
    std::vector<std::uint8_t> template_;
    std::map<std::uint16_t, std::vector<std::uint8_t>> reads_;  // ptp4l's answers by management id
    int socket_ = -1;
    std::atomic<bool> stopping_{false};
    std::atomic<int> ready_{0};  // 1 listening, -1 failed
    std::string failure_;
    std::atomic<std::uint64_t> sent_{0};
    std::thread thread_;
};

}  // namespace qvtest

#endif
