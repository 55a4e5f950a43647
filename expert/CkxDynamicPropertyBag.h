#ifndef QV_EXPERT_CKXDYNAMICPROPERTYBAG_H
#define QV_EXPERT_CKXDYNAMICPROPERTYBAG_H

#include <map>
#include <memory>
#include <set>
#include <span>

#include "expert/CQVComMultiThreadModelNoCS.h"
#include "expert/CQVComObjectRootEx.h"
#include "expert/CkxPropertyValue.h"
#include "qv1588/corbel.h"

// Tags in the order of their value as signed 32-bit integers.
struct CkxSignedTagOrder {
    bool operator()(kxSysAttributeTagID left, kxSysAttributeTagID right) const noexcept {
        return static_cast<LONG>(left) < static_cast<LONG>(right);
    }
};

// The expert's property bag: one typed value per attribute tag, and the set of tags that a
// setter succeeded on since the last ClearChangedTags (removing a value leaves its tag
// there). A tag keeps the type of its first value: a setter or getter of another type fails
// with CORBEL_E_TYPE_MISMATCH and changes nothing. Create it as
// CQVComObject<CkxDynamicPropertyBag>. One thread uses a bag at a time.
//
// Its enumerators hold a reference to the bag and stay safe when the bag changes while
// they walk it: they go on after the tag they delivered last.
class CkxDynamicPropertyBag : public IkxSysPropertyBag2,
                              public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    using ValueMap =
        std::map<kxSysAttributeTagID, std::unique_ptr<CkxPropertyValue>, CkxSignedTagOrder>;
    using TagSet = std::set<kxSysAttributeTagID>;

    static std::span<const QVInterfaceEntry> InterfaceTable();

    HRESULT KXSYS_CALL EnumerateTags(IkxSysEnumPropertyTag** tags) override;
    HRESULT KXSYS_CALL HasTag(kxSysAttributeTagID tag) override;
    HRESULT KXSYS_CALL GetTagType(kxSysAttributeTagID tag, ULONG* type) override;
    HRESULT KXSYS_CALL RemoveTag(kxSysAttributeTagID tag) override;
    HRESULT KXSYS_CALL RemoveAllTags() override;
    HRESULT KXSYS_CALL SetBool(kxSysAttributeTagID tag, BOOL value) override;
    HRESULT KXSYS_CALL SetLong(kxSysAttributeTagID tag, LONG value) override;
    HRESULT KXSYS_CALL SetULong(kxSysAttributeTagID tag, ULONG value) override;
    HRESULT KXSYS_CALL SetDouble(kxSysAttributeTagID tag, double value) override;
    HRESULT KXSYS_CALL SetGUID(kxSysAttributeTagID tag, const GUID* value) override;
    HRESULT KXSYS_CALL SetString(kxSysAttributeTagID tag, const OLECHAR* value) override;
    HRESULT KXSYS_CALL SetDateTime(kxSysAttributeTagID tag, const LONG* fields) override;
    HRESULT KXSYS_CALL GetBool(kxSysAttributeTagID tag, BOOL* value) override;
    HRESULT KXSYS_CALL GetLong(kxSysAttributeTagID tag, LONG* value) override;
    HRESULT KXSYS_CALL GetULong(kxSysAttributeTagID tag, ULONG* value) override;
    HRESULT KXSYS_CALL GetDouble(kxSysAttributeTagID tag, double* value) override;
    HRESULT KXSYS_CALL GetGUID(kxSysAttributeTagID tag, GUID* value) override;
    HRESULT KXSYS_CALL GetString(kxSysAttributeTagID tag, BSTR* value) override;
    HRESULT KXSYS_CALL GetDateTime(kxSysAttributeTagID tag, LONG* fields) override;
    HRESULT KXSYS_CALL Clone(IkxSysPropertyBag2** copy) override;
    HRESULT KXSYS_CALL ClearChangedTags() override;
    HRESULT KXSYS_CALL EnumerateChangedTags(IkxSysEnumPropertyTag** tags) override;
    HRESULT KXSYS_CALL GetTimestamp(kxSysAttributeTagID tag, kxSysAttrTimestampUTC* value) override;
    HRESULT KXSYS_CALL SetTimestamp(kxSysAttributeTagID tag,
                                    const kxSysAttrTimestampUTC* value) override;

  protected:
    CkxDynamicPropertyBag() = default;
    virtual ~CkxDynamicPropertyBag();

  private:
    using Copier = HRESULT (*)(CkxDynamicPropertyBag& to, kxSysAttributeTagID tag,
                               const CkxPropertyValue& from);

    template <class T>
    HRESULT store(kxSysAttributeTagID tag, T value);
    template <class T>
    HRESULT lookup(kxSysAttributeTagID tag, const T** value) const;
    template <class T>
    HRESULT getCopy(kxSysAttributeTagID tag, T* value) const;
    template <class T>
    static HRESULT copyValue(CkxDynamicPropertyBag& to, kxSysAttributeTagID tag,
                             const CkxPropertyValue& from);
    static std::span<const Copier> copiers();

    ValueMap values_;
    TagSet changed_;
};

#endif
