#ifndef QV_EXPERT_CQVCOMENUMONSTL_H
#define QV_EXPERT_CQVCOMENUMONSTL_H

#include <span>

#include "expert/CQVComMultiThreadModelNoCS.h"
#include "expert/CQVComObject.h"
#include "expert/CQVComObjectRootEx.h"
#include "expert/IQVEnumOnSTLImpl.h"

// The enumerator that Clone makes: it walks its source's container and never owns it; its
// owner reference keeps the container alive.
template <class Base, const IID* piid, class T, class Copy, class Container>
class CQVComEnumOnSTL : public IQVEnumOnSTLImpl<Base, piid, T, Copy, Container>,
                        public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    static std::span<const QVInterfaceEntry> InterfaceTable() {
        static constexpr QVInterfaceEntry kTable[] = {QVInterface<CQVComEnumOnSTL, Base>(*piid)};
        return kTable;
    }

  protected:
    CQVComEnumOnSTL() = default;
    ~CQVComEnumOnSTL() override = default;
};

template <class Base, const IID* piid, class T, class Copy, class Container>
HRESULT KXSYS_CALL IQVEnumOnSTLImpl<Base, piid, T, Copy, Container>::Clone(Base** copy) {
    return QVGuardedSlot([&]() -> HRESULT {
        if (copy == nullptr) {
            return E_POINTER;
        }
        *copy = nullptr;
        using Clone = CQVComObject<CQVComEnumOnSTL<Base, piid, T, Copy, Container>>;
        Clone* created = nullptr;
        const HRESULT creation = Clone::CreateInstance(&created);
        if (FAILED(creation)) {
            return creation;
        }
        CQVComPtr<Clone> held(created);
        // An enumerator that owns its container keeps it alive for the clone by being its
        // owner; otherwise the clone shares the source's owner.
        IUnknown* owner = owner_ ? owner_.get() : static_cast<Base*>(this);
        IQVEnumOnSTLImpl& target = *created;
        target.owner_ = CQVComPtr<IUnknown>(owner);
        target.container_ = container_;
        target.cursor_ = cursor_;
        void* answered = nullptr;
        const HRESULT query = created->QueryInterface(*piid, &answered);
        if (SUCCEEDED(query)) {
            *copy = static_cast<Base*>(answered);
        }
        return query;
    });
}

#endif
