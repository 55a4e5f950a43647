#ifndef QV_EXPERT_CKXPROPERTYVALUE_H
#define QV_EXPERT_CKXPROPERTYVALUE_H

#include "qv1588/corbel.h"

// One value in a property bag, of one of the seven types (kxSysPropertyType); the typed
// classes are the instantiations of CkxTemplatePropertyValue.
class CkxPropertyValue {
  public:
    CkxPropertyValue(const CkxPropertyValue&) = delete;
    CkxPropertyValue& operator=(const CkxPropertyValue&) = delete;
    virtual ~CkxPropertyValue() = default;

    ULONG type() const noexcept { return type_; }

  protected:
    explicit CkxPropertyValue(ULONG type) noexcept : type_(type) {}

  private:
    ULONG type_;
};

#endif
