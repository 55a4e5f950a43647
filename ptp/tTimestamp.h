#ifndef QV_PTP_TTIMESTAMP_H
#define QV_PTP_TTIMESTAMP_H

#include <cstdint>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// 48-bit seconds and 32-bit nanoseconds (10 octets). The nanoseconds are not range-checked:
// a clock's value is passed on as it came.
class tTimestamp : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kSize = 10;

    tTimestamp() = default;
    tTimestamp(std::uint64_t seconds, std::uint32_t nanoseconds)
        : secondsField_(seconds), nanosecondsField_(nanoseconds) {}
    tTimestamp(const tTimestamp&) = default;
    tTimestamp& operator=(const tTimestamp&) = default;

    bool operator==(const tTimestamp& other) const {
        return secondsField_ == other.secondsField_ && nanosecondsField_ == other.nanosecondsField_;
    }

    void getValue(std::uint64_t& seconds, std::uint32_t& nanoseconds) const {
        seconds = secondsField_;
        nanoseconds = nanosecondsField_;
    }
    void setValue(std::uint64_t seconds, std::uint32_t nanoseconds) {
        secondsField_ = seconds;
        nanosecondsField_ = nanoseconds;
    }
    std::uint64_t getSeconds() const { return secondsField_; }
    std::uint32_t getNanoseconds() const { return nanosecondsField_; }

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return kSize; }

  private:
    std::uint64_t secondsField_ = 0;  // the low 48 bits go on the wire
    std::uint32_t nanosecondsField_ = 0;
};

}  // namespace nQVPTP000

#endif
