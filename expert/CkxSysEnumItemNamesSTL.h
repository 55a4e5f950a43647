#ifndef QV_EXPERT_CKXSYSENUMITEMNAMESSTL_H
#define QV_EXPERT_CKXSYSENUMITEMNAMESSTL_H

#include <list>
#include <memory>
#include <span>
#include <string>

#include "expert/CQVComEnumOnSTL.h"
#include "expert/QVEnumCopyPolicies.h"

// The names of items, as new BSTRs. The list is the enumerator's own when it has no owner.
class CkxSysEnumItemNamesSTL
    : public IQVEnumOnSTLImpl<IkxSysEnumStringList, &IID_IkxSysEnumStringList, BSTR,
                              QVCopyNamePolicy, std::list<std::u16string>>,
      public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    using NameList = std::list<std::u16string>;

    static std::span<const QVInterfaceEntry> InterfaceTable() {
        static constexpr QVInterfaceEntry kTable[] = {
            QVInterface<CkxSysEnumItemNamesSTL, IkxSysEnumStringList>(IID_IkxSysEnumStringList)};
        return kTable;
    }

    // Takes the list over and stands on its first name.
    void Adopt(std::unique_ptr<const NameList> names) noexcept {
        IQVEnumOnSTLImpl::Adopt(std::move(names));
    }

  protected:
    CkxSysEnumItemNamesSTL() = default;
    ~CkxSysEnumItemNamesSTL() override = default;
};

#endif
