#ifndef QV_CORBEL_SERVE_HISTORY_H
#define QV_CORBEL_SERVE_HISTORY_H

#include <cstddef>
#include <cstdint>
#include <mutex>
#include <optional>
#include <vector>

namespace corbel {

struct HistorySample {
    std::int64_t unixMilliseconds = 0;
    std::optional<double> offsetFromMaster, meanPathDelay;  // nanoseconds
    std::optional<std::int32_t> portState;
};

// The last `capacity` samples of one clock, oldest overwritten first. Appended to by the
// poller, copied out by HTTP workers. Kept column by column in 15 octets a sample (an
// hour at 1 s is 53 KiB a clock, allocated whole at once so that memory does not creep):
// times as seconds and milliseconds, offset and delay as float (exact for whole
// nanoseconds below 16.7 ms), the port state in one octet.
class History {
  public:
    static constexpr std::size_t kDefaultCapacity = 3600;

    explicit History(std::size_t capacity = kDefaultCapacity);

    void append(const HistorySample& sample);
    // Oldest first.
    std::vector<HistorySample> samples() const;

  private:
    mutable std::mutex lock_;
    // Guarded by lock_: the columns, a ring whose next slot is next_.
    std::vector<std::uint32_t> seconds_;
    std::vector<std::uint16_t> milliseconds_;
    std::vector<float> offsets_, delays_;  // NaN: not read
    std::vector<std::int8_t> states_;      // -1: not read
    std::size_t next_ = 0, count_ = 0;
};

}  // namespace corbel

#endif
