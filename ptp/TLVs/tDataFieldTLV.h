#ifndef QV_PTP_TLVS_TDATAFIELDTLV_H
#define QV_PTP_TLVS_TDATAFIELDTLV_H

#include <cstdint>
#include <memory>

#include "ptp/TLVs/tFieldReader.h"
#include "ptp/TLVs/tFieldSizer.h"
#include "ptp/TLVs/tFieldWriter.h"
#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/tManagementTLV.h"

namespace nQVPTP000 {

// A management TLV whose data field `Derived` describes once, as a field walk:
//
//     template <typename Self, typename Visitor>
//     static void walk(Self& self, Visitor& visitor);
//
// listing the fields in wire order (`Self` is const when writing or measuring). Encoding,
// decoding, the data field's size and so lengthField all follow from that one list.
template <typename Derived>
class tDataFieldTLV : public tManagementTLV {
  public:
    void deserializeDataField(iSerializableTarget& source, tStatus& status) override {
        tFieldReader reader(source, status);
        Derived::walk(derived(), reader);
    }
    void serializeDataField(iSerializableTarget& target, tStatus& status) const override {
        tFieldWriter writer(target, status);
        Derived::walk(derived(), writer);
    }
    std::unique_ptr<tTLV> clone(tStatus& status) const override {
        return cloneWith(status, [this] { return std::make_unique<Derived>(derived()); });
    }

  protected:
    explicit tDataFieldTLV(std::uint16_t managementId) : tManagementTLV(managementId) {}
    tDataFieldTLV(const tDataFieldTLV&) = default;
    tDataFieldTLV& operator=(const tDataFieldTLV&) = default;

    // The data field's size as the walk measures it.
    std::uint16_t dataFieldSize() const {
        tFieldSizer sizer;
        Derived::walk(derived(), sizer);
        return sizer.size();
    }
    // For the end of a constructor: lengthField from the members.
    void updateLength(std::uint16_t alignment = 1) {
        tStatus scratch;
        setDataLength(dataFieldSize(), scratch, alignment);
    }

    // The answer to a request once the clock has been asked with `clockStatus`: the TLV
    // itself, or GENERAL_ERROR with `failureText` when the clock failed. Null when the
    // caller's status holds an error.
    tManagementMessagePayload* answer(const tStatus& clockStatus, const char* failureText,
                                      tStatus& status) {
        if (status.failed()) {
            return nullptr;
        }
        if (clockStatus.failed()) {
            return errorAnswer(tManagementErrorStatusTLV::kGeneralError, failureText, status);
        }
        return this;
    }
    tManagementMessagePayload* answerGet(const tStatus& clockStatus, tStatus& status) {
        return answer(clockStatus, "Failure getting value", status);
    }
    tManagementMessagePayload* answerSet(const tStatus& clockStatus, tStatus& status) {
        return answer(clockStatus, "Failure setting value", status);
    }

  private:
    const Derived& derived() const { return static_cast<const Derived&>(*this); }
    Derived& derived() { return static_cast<Derived&>(*this); }
};

}  // namespace nQVPTP000

#endif
