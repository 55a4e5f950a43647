#ifndef QV_PTP_TPTPMESSAGE_H
#define QV_PTP_TPTPMESSAGE_H

#include <cstdint>
#include <memory>

#include "ptp/iPTPSerializable.h"
#include "ptp/tMessageHeader.h"
#include "ptp/tMessageSuffix.h"

namespace nQVPTP000 {

// A PTP message: the common header, a body that each message class supplies, and the
// suffix of TLVs. The message owns header and suffix; either may be missing after an
// allocation failure, and the message then has size 0 and refuses to be written or read.
class tPTPMessage : public iPTPSerializable {
  public:
    ~tPTPMessage() override;
    tPTPMessage(const tPTPMessage&) = delete;
    tPTPMessage& operator=(const tPTPMessage&) = delete;

    // Writes the header with messageLength set to the message's size, the body and the
    // suffix, so that messageLength always counts the octets written.
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    // Copies every header field of `other` and appends a clone of each of its TLVs; the
    // body of a derived class is not copied.
    virtual void assign(const tPTPMessage& other, tStatus& status);

    // Owned by the message; null only after an allocation failure.
    tMessageHeader* getHeader() const { return header_.get(); }
    tMessageSuffix* getSuffix() const { return suffix_.get(); }

  protected:
    // A message to be sent: a default header and an empty suffix.
    explicit tPTPMessage(tStatus& status);
    // A received message: takes the header already read and makes an empty suffix.
    tPTPMessage(std::unique_ptr<tMessageHeader> header, tStatus& status);

    virtual void deserializeHeader(iSerializableTarget& source, tStatus& status);
    virtual void deserializeBody(iSerializableTarget& source, tStatus& status) = 0;
    virtual void deserializeSuffix(iSerializableTarget& source, tStatus& status);
    virtual void serializeHeader(iSerializableTarget& target, tStatus& status) const;
    virtual void serializeBody(iSerializableTarget& target, tStatus& status) const = 0;
    virtual void serializeSuffix(iSerializableTarget& target, tStatus& status) const;

    // Header + body + suffix, or 0 when header or suffix is missing.
    std::uint16_t sizeWithBody(std::uint16_t bodySize) const;
    bool complete() const { return header_ && suffix_; }
    // The dumps of header and suffix, each when present, for the message classes' traces.
    void traceHeader(nQVTARN000::tTrace& trace) const;
    void traceSuffix(nQVTARN000::tTrace& trace) const;

  private:
    bool refuseIncomplete(tStatus& status) const;

    std::unique_ptr<tMessageHeader> header_;
    std::unique_ptr<tMessageSuffix> suffix_;
};

}  // namespace nQVPTP000

#endif
