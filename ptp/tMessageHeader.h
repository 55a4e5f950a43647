#ifndef QV_PTP_TMESSAGEHEADER_H
#define QV_PTP_TMESSAGEHEADER_H

#include <array>
#include <cstdint>

#include "ptp/iPTPSerializable.h"
#include "ptp/tPortIdentity.h"

namespace nQVPTP000 {

// The 34-octet header that every PTP message starts with.
class tMessageHeader final : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kSize = 34;

    // messageType values.
    enum tMessageType : std::uint32_t {
        kSync = 0x0,
        kDelayReq = 0x1,
        kPdelayReq = 0x2,
        kPdelayResp = 0x3,
        kFollowUp = 0x8,
        kDelayResp = 0x9,
        kPdelayRespFollowUp = 0xA,
        kAnnounce = 0xB,
        kSignaling = 0xC,
        kManagement = 0xD,
    };

    // The twelve flags, in the order in which they are held and traced.
    enum class tFlag : unsigned {
        alternateMaster,
        twoStep,
        unicast,
        profileSpecific1,
        profileSpecific2,
        secure,
        leap61,
        leap59,
        currentUtcOffsetValid,
        ptpTimescale,
        timeTraceable,
        frequencyTraceable,
    };
    static constexpr std::size_t kFlagCount = 12;

    // A header to be sent: an Announce-type default addressed from all ports of all clocks.
    tMessageHeader();
    // A received header, read at once from `source`.
    tMessageHeader(iSerializableTarget& source, tStatus& status);
    tMessageHeader(const tMessageHeader&) = default;
    tMessageHeader& operator=(const tMessageHeader&) = default;

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return kSize; }

    std::uint8_t getTransportSpecific() const { return transportSpecific_; }
    std::uint32_t getMessageType() const { return messageType_; }
    std::uint8_t getVersionPTP() const { return versionPTP_; }
    std::uint16_t getMessageLength() const { return messageLength_; }
    std::uint8_t getDomainNumber() const { return domainNumber_; }
    bool getFlag(tFlag flag) const { return flags_[static_cast<unsigned>(flag)]; }
    std::int64_t getCorrectionField() const { return correctionField_; }
    tPortIdentity getSourcePortIdentity() const { return sourcePortIdentity_; }
    std::uint16_t getSequenceId() const { return sequenceId_; }
    std::uint8_t getControlField() const { return controlField_; }
    std::int8_t getLogMessageInterval() const { return logMessageInterval_; }

    // Each setter changes nothing once the status holds an error. setMessageType also sets
    // controlField, which IEEE 1588-2008 derives from the type.
    void setMessageType(std::uint32_t messageType, tStatus& status);
    void setDomainNumber(std::uint8_t domainNumber, tStatus& status);
    void setSequenceId(std::uint16_t sequenceId, tStatus& status);
    void setMessageLength(std::uint16_t messageLength, tStatus& status);
    void setSourcePortIdentity(const tPortIdentity& identity, tStatus& status);
    void setFlag(tFlag flag, bool value, tStatus& status);

  private:
    void serializeFlags(iSerializableTarget& target, tStatus& status) const;
    void deserializeFlags(iSerializableTarget& source, tStatus& status);

    std::uint8_t transportSpecific_ = 0;
    std::uint32_t messageType_ = kAnnounce;
    std::uint8_t versionPTP_ = 2;
    std::uint16_t messageLength_ = 0;
    std::uint8_t domainNumber_ = 0;
    std::array<bool, kFlagCount> flags_{};
    std::int64_t correctionField_ = 0;
    tPortIdentity sourcePortIdentity_ = allOnesPortIdentity();
    std::uint16_t sequenceId_ = 0;
    std::uint8_t controlField_ = 0;
    std::int8_t logMessageInterval_ = 0x7F;
};

}  // namespace nQVPTP000

#endif
