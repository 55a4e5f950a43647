#ifndef QV_PTP_IPTPSERIALIZABLE_H
#define QV_PTP_IPTPSERIALIZABLE_H

#include <cstdint>

#include "platform/iTraceable.h"
#include "platform/tStatus.h"
#include "ptp/iSerializableTarget.h"

namespace nQVPTP000 {

// Every PTP value, TLV, header and message: it traces itself, writes its wire form to a
// target and reads it back. Fields are chained without testing the status in between: the
// first failure turns the remaining fields into no-ops.
class iPTPSerializable : public nQVTARN000::iTraceable {
  public:
    virtual void serialize(iSerializableTarget& target, tStatus& status) const = 0;
    virtual void deserialize(iSerializableTarget& source, tStatus& status) = 0;
    // Octets of the wire form.
    virtual std::uint16_t getSize() const = 0;
};

}  // namespace nQVPTP000

#endif
