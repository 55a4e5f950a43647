#ifndef QV_PTP_TPTPTEXT_H
#define QV_PTP_TPTPTEXT_H

#include <cstdint>
#include <memory>
#include <string_view>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// A PTPText: a length octet and that many octets of UTF-8, no terminating zero. The class
// does not look inside the octets.
class tPTPText : public iPTPSerializable {
  public:
    static constexpr std::size_t kMaxLength = 255;

    tPTPText() = default;
    // A text of 256 octets or more records -52005 and leaves this one empty.
    tPTPText(const char* text, tStatus& status);
    // Deep copies. Like any value, a copy that cannot get memory throws std::bad_alloc
    // (the target keeps its text): a quietly emptied copy would pass for the real text.
    tPTPText(const tPTPText& other);
    tPTPText& operator=(const tPTPText& other);
    tPTPText(tPTPText&&) noexcept = default;
    tPTPText& operator=(tPTPText&&) noexcept = default;

    bool operator==(const tPTPText& other) const { return view() == other.view(); }

    void setText(const std::uint8_t* text, std::uint8_t length, tStatus& status);
    // May be null when the text is empty.
    const std::uint8_t* getTextField() const { return textField_.get(); }
    std::uint8_t getLengthField() const { return lengthField_; }
    std::string_view view() const;

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    // A text cut short by the end of the data keeps the previous text.
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return static_cast<std::uint16_t>(lengthField_ + 1); }

  private:
    static std::unique_ptr<std::uint8_t[]> allocate(std::size_t length, tStatus& status);

    std::uint8_t lengthField_ = 0;
    std::unique_ptr<std::uint8_t[]> textField_;  // exactly lengthField_ octets, null when 0
};

}  // namespace nQVPTP000

#endif
