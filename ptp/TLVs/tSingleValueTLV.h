#ifndef QV_PTP_TLVS_TSINGLEVALUETLV_H
#define QV_PTP_TLVS_TSINGLEVALUETLV_H

#include <cstdint>

#include "platform/tTrace.h"
#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// How the value octet of a single-value TLV is laid out.
enum class tValueForm {
    kPlain,      // the whole octet (signed values in two's complement)
    kLowBit,     // seven zero bits, the flag in the least significant bit
    kLowNibble,  // a reserved high nibble, the value in the low nibble
};

// A management TLV of one value: the value octet, then one reserved octet (lengthField 4).
// `Derived` names the value and the clock member it stands for:
//
//     static constexpr std::uint16_t kId;     the managementId
//     static constexpr const char* kLabel;    its trace label, "priority1: " ...
//     static constexpr Value kDefault;
//     static Value get(iManagedClock&, std::uint16_t port, tStatus&);
//     static void set(iManagedClock&, std::uint16_t port, Value, tStatus&);
//
// and, when a SET must refuse some values, `static const char* refusal(Value)` giving the
// WRONG_VALUE display text of a refused value, or null.
template <typename Derived, typename Value, tValueForm Form = tValueForm::kPlain>
class tSingleValueTLV : public tDataFieldTLV<Derived> {
  public:
    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        if constexpr (Form == tValueForm::kLowBit) {
            visitor.flags8(flagBit(self.value_, 0x01));
        } else if constexpr (Form == tValueForm::kLowNibble) {
            visitor.lowNibble(self.value_);
        } else {
            visitor.field(self.value_);
        }
        visitor.reserved(1);
    }

    Value getValue() const { return value_; }
    void setValue(Value value, tStatus& status) {
        if (status.succeeded()) {
            value_ = value;
        }
    }

    // The label, the value (decimal, or true(1)/false(0)), a line end.
    void trace(nQVTARN000::tTrace& trace) const override {
        tManagementTLV::trace(trace);
        trace.append(Derived::kLabel).append(value_).append("\n");
    }

    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override {
        if (status.failed()) {
            return nullptr;
        }
        tStatus clockStatus;
        const Value value = Derived::get(clock, port, clockStatus);
        if (clockStatus.succeeded()) {
            value_ = value;
        }
        return this->answerGet(clockStatus, status);
    }

    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override {
        if (status.failed()) {
            return nullptr;
        }
        if constexpr (requires { Derived::refusal(value_); }) {
            if (const char* text = Derived::refusal(value_); text != nullptr) {
                return this->errorAnswer(tManagementErrorStatusTLV::kWrongValue, text, status);
            }
        }
        tStatus clockStatus;
        Derived::set(clock, port, value_, clockStatus);
        return this->answerSet(clockStatus, status);
    }

  protected:
    tSingleValueTLV() : tDataFieldTLV<Derived>(Derived::kId), value_(Derived::kDefault) {
        tFieldSizer sizer;
        walk(*this, sizer);
        tStatus scratch;
        this->setDataLength(sizer.size(), scratch, 1);
    }
    tSingleValueTLV(const tSingleValueTLV&) = default;
    tSingleValueTLV& operator=(const tSingleValueTLV&) = default;

    Value value_;
};

}  // namespace nQVPTP000

#endif
