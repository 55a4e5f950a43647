#ifndef QV_EXPERT_CLOCKS_CPTPBAGFILLER_H
#define QV_EXPERT_CLOCKS_CPTPBAGFILLER_H

#include <string>

#include "platform/OleText.h"
#include "qv1588/corbel.h"

// Sets values into a bag and keeps the first failure, so that a reader sets a whole group
// and tests the outcome once.
class CPtpBagFiller {
  public:
    explicit CPtpBagFiller(IkxSysPropertyBag2& bag) : bag_(bag) {}

    CPtpBagFiller& setBool(kxSysAttributeTagID tag, bool value) {
        return keep(bag_.SetBool(tag, value ? 1 : 0));
    }
    CPtpBagFiller& setLong(kxSysAttributeTagID tag, LONG value) {
        return keep(bag_.SetLong(tag, value));
    }
    CPtpBagFiller& setULong(kxSysAttributeTagID tag, ULONG value) {
        return keep(bag_.SetULong(tag, value));
    }
    CPtpBagFiller& setDouble(kxSysAttributeTagID tag, double value) {
        return keep(bag_.SetDouble(tag, value));
    }
    CPtpBagFiller& setString(kxSysAttributeTagID tag, const std::u16string& value) {
        return keep(bag_.SetString(tag, qv::dsc::OleText::toBoundary(value).c_str()));
    }
    CPtpBagFiller& setTimestamp(kxSysAttributeTagID tag, const kxSysAttrTimestampUTC& value) {
        return keep(bag_.SetTimestamp(tag, &value));
    }

    HRESULT result() const { return result_; }
    bool succeeded() const { return SUCCEEDED(result_); }

  private:
    CPtpBagFiller& keep(HRESULT result) {
        if (SUCCEEDED(result_) && FAILED(result)) {
            result_ = result;
        }
        return *this;
    }

    IkxSysPropertyBag2& bag_;
    HRESULT result_ = S_OK;
};

#endif
