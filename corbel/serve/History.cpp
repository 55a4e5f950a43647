#include "corbel/serve/History.h"

#include <cmath>
#include <limits>

namespace corbel {

namespace {

constexpr float kNotRead = std::numeric_limits<float>::quiet_NaN();

float column(const std::optional<double>& value) {
    return value ? static_cast<float>(*value) : kNotRead;
}

std::optional<double> fromColumn(float value) {
    return std::isnan(value) ? std::nullopt : std::optional<double>(value);
}

}  // namespace

History::History(std::size_t capacity)
    : seconds_(capacity),
      milliseconds_(capacity),
      offsets_(capacity, kNotRead),
      delays_(capacity, kNotRead),
      states_(capacity, -1) {}

void History::append(const HistorySample& sample) {
    const std::lock_guard guard(lock_);
    if (seconds_.empty()) {
        return;
    }
    seconds_[next_] = static_cast<std::uint32_t>(sample.unixMilliseconds / 1000);
    milliseconds_[next_] = static_cast<std::uint16_t>(sample.unixMilliseconds % 1000);
    offsets_[next_] = column(sample.offsetFromMaster);
    delays_[next_] = column(sample.meanPathDelay);
    const bool octet = sample.portState && *sample.portState >= 0 && *sample.portState <= 127;
    states_[next_] = octet ? static_cast<std::int8_t>(*sample.portState) : std::int8_t{-1};
    next_ = (next_ + 1) % seconds_.size();
    count_ = count_ < seconds_.size() ? count_ + 1 : count_;
}

std::vector<HistorySample> History::samples() const {
    const std::lock_guard guard(lock_);
    std::vector<HistorySample> result;
    result.reserve(count_);
    const std::size_t capacity = seconds_.size();
    for (std::size_t i = 0; i < count_; ++i) {
        const std::size_t slot = (next_ + capacity - count_ + i) % capacity;
        HistorySample sample;
        sample.unixMilliseconds =
            static_cast<std::int64_t>(seconds_[slot]) * 1000 + milliseconds_[slot];
        sample.offsetFromMaster = fromColumn(offsets_[slot]);
        sample.meanPathDelay = fromColumn(delays_[slot]);
        if (states_[slot] >= 0) {
            sample.portState = states_[slot];
        }
        result.push_back(sample);
    }
    return result;
}

}  // namespace corbel
