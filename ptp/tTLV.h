#ifndef QV_PTP_TTLV_H
#define QV_PTP_TTLV_H

#include <cstdint>
#include <memory>
#include <new>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// A TLV of a message suffix: tlvType, lengthField, then a value that each kind supplies.
// getSize is always lengthField + 4, so lengthField must stay consistent with the value: a
// received TLV has its lengthField matched to its value once it is decoded.
class tTLV : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kManagement = 0x0001;
    static constexpr std::uint16_t kManagementErrorStatus = 0x0002;
    static constexpr std::uint16_t kOrganizationExtension = 0x0003;

    tTLV() = default;
    explicit tTLV(std::uint16_t tlvType) : tlvType_(tlvType) {}

    // "tlvType %u lengthField %u "
    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return static_cast<std::uint16_t>(lengthField_ + 4); }

    // Sets lengthField to `length` rounded up to a multiple of `alignment` (1 or 2) and
    // returns the pad octets that the rounding added; nothing once the status holds an error.
    virtual std::uint16_t setDataLength(std::uint16_t length, tStatus& status,
                                        std::uint16_t alignment);
    virtual void deserializeValue(iSerializableTarget& source, tStatus& status) = 0;
    virtual void serializeValue(iSerializableTarget& target, tStatus& status) const = 0;
    // A copy owned by the caller, or null when the status holds an error or memory is out.
    virtual std::unique_ptr<tTLV> clone(tStatus& status) const = 0;

    // Sets lengthField to the octets that serializeValue writes. A sender's lengthField may
    // claim more than the fields it holds (or a text the datagram cut off); what this TLV
    // writes back must still frame itself, in a copy too. -52000 and no change when memory
    // is out.
    void matchLengthField(tStatus& status);

    std::uint16_t getTlvType() const { return tlvType_; }
    std::uint16_t getLengthField() const { return lengthField_; }
    void setTlvType(std::uint16_t tlvType, tStatus& status);

  protected:
    tTLV(const tTLV&) = default;
    tTLV& operator=(const tTLV&) = default;

    // Runs `make` (which allocates the copy) unless the status holds an error; an exhausted
    // memory records -52000 and gives null.
    template <typename Make>
    static std::unique_ptr<tTLV> cloneWith(tStatus& status, Make&& make);

  private:
    std::uint16_t tlvType_ = kManagement;
    std::uint16_t lengthField_ = 0;
};

template <typename Make>
std::unique_ptr<tTLV> tTLV::cloneWith(tStatus& status, Make&& make) {
    if (status.failed()) {
        return nullptr;
    }
    try {
        return make();
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
        return nullptr;
    }
}

}  // namespace nQVPTP000

#endif
