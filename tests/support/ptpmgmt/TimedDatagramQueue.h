#ifndef QV_TESTS_SUPPORT_PTPMGMT_TIMEDDATAGRAMQUEUE_H
#define QV_TESTS_SUPPORT_PTPMGMT_TIMEDDATAGRAMQUEUE_H

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <vector>

namespace qvtest {

// Datagrams that fall due at given times: taken in order of their due time, and in order
// of arrival among those due at the same time.
class TimedDatagramQueue {
  public:
    using tClock = std::chrono::steady_clock;

    void push(std::vector<std::uint8_t> octets, tClock::time_point due);
    // Waits until the earliest datagram is due and takes it into `octets`; returns false
    // instead as soon as `interrupted` answers true. `interrupted` is asked under the
    // queue's lock at the start and after every wake().
    bool pop(std::vector<std::uint8_t>& octets, const std::function<bool()>& interrupted);
    // Call after changing what the `interrupted` of a waiting pop looks at.
    void wake();
    void clear();
    std::size_t size() const;

  private:
    mutable std::mutex lock_;
    std::condition_variable changed_;
    std::multimap<tClock::time_point, std::vector<std::uint8_t>> datagrams_;  // guarded
};

}  // namespace qvtest

#endif
