#ifndef QV_EXPERT_CKXSYSENUMPROPERTYTAGSSTL_H
#define QV_EXPERT_CKXSYSENUMPROPERTYTAGSSTL_H

#include <memory>
#include <span>

#include "expert/CQVComEnumOnSTL.h"
#include "expert/QVEnumCopyPolicies.h"

// Attribute tags from an ordered set of tags, or the keys of an ordered map from tag. The
// container is the enumerator's own when it has no owner (Adopt); a bag enumerates its own
// containers with itself as the owner (Init).
template <class Container>
class CkxSysEnumPropertyTagsSTL
    : public IQVEnumOnSTLImpl<IkxSysEnumPropertyTag, &IID_IkxSysEnumPropertyTag,
                              kxSysAttributeTagID, QVCopyTagPolicy, Container>,
      public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
    using Impl = IQVEnumOnSTLImpl<IkxSysEnumPropertyTag, &IID_IkxSysEnumPropertyTag,
                                  kxSysAttributeTagID, QVCopyTagPolicy, Container>;

  public:
    static std::span<const QVInterfaceEntry> InterfaceTable() {
        static constexpr QVInterfaceEntry kTable[] = {
            QVInterface<CkxSysEnumPropertyTagsSTL, IkxSysEnumPropertyTag>(
                IID_IkxSysEnumPropertyTag)};
        return kTable;
    }

    // Takes the container over and stands on its first tag.
    void Adopt(std::unique_ptr<const Container> tags) noexcept { Impl::Adopt(std::move(tags)); }

  protected:
    CkxSysEnumPropertyTagsSTL() = default;
    ~CkxSysEnumPropertyTagsSTL() override = default;
};

#endif
