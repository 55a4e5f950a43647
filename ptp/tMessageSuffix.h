#ifndef QV_PTP_TMESSAGESUFFIX_H
#define QV_PTP_TMESSAGESUFFIX_H

#include <cstddef>
#include <memory>
#include <vector>

#include "ptp/iPTPSerializable.h"
#include "ptp/tTLV.h"

namespace nQVPTP000 {

// The TLVs that follow a message body, owned by the suffix.
//
// Reading goes on until the data runs out, which is how every well-formed message ends;
// TLVs of kinds the codec does not build, and malformed ones, are skipped whole, so that one
// bad TLV never costs the others. A TLV that could not be added for lack of memory is
// recorded at once as -52000, and the suffix remembers the loss: clearing a list that once
// lost a TLV records -52000 again, so that no later user mistakes it for complete.
class tMessageSuffix final : public iPTPSerializable {
  public:
    tMessageSuffix() = default;
    ~tMessageSuffix() override;
    tMessageSuffix(const tMessageSuffix&) = delete;
    tMessageSuffix& operator=(const tMessageSuffix&) = delete;

    // "--- Begin TLV %u ---" TLV "--- End TLV %u ---" for each TLV.
    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override;

    std::size_t getCount() const { return tlvs_.size(); }
    // The TLV at `index`, owned by the suffix; -52012 and null beyond the list.
    tTLV* getTLV(std::size_t index, tStatus& status) const;
    // Appends unless the status holds an error; a TLV that is not added is destroyed.
    void addTLV(std::unique_ptr<tTLV> tlv, tStatus& status);
    // Destroys all TLVs, the last one first, unless the status holds an error.
    void clear(tStatus& status);

  private:
    void destroyAll();

    std::vector<std::unique_ptr<tTLV>> tlvs_;
    bool growthFailed_ = false;
};

}  // namespace nQVPTP000

#endif
