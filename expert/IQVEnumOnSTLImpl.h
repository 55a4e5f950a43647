#ifndef QV_EXPERT_IQVENUMONSTLIMPL_H
#define QV_EXPERT_IQVENUMONSTLIMPL_H

#include <memory>

#include "expert/CQVComPtr.h"
#include "expert/QVEnumCursor.h"
#include "expert/QVGuardedSlot.h"
#include "qv1588/corbel.h"

// Next, Skip, Reset and Clone of a host enumerator interface Base (identifier *piid) over an
// ordered Container whose elements Copy hands out as T. The container is either owned by
// the enumerator itself or kept alive by the owner reference.
//
// Clone is defined with CQVComEnumOnSTL (CQVComEnumOnSTL.h), the class it creates.
template <class Base, const IID* piid, class T, class Copy, class Container>
class IQVEnumOnSTLImpl : public Base {
  public:
    using ContainerType = Container;

    // Walks `container`, which `owner` keeps alive (the enumerator takes a reference to it).
    void Init(IUnknown* owner, const Container* container) noexcept {
        owner_ = CQVComPtr<IUnknown>(owner);
        container_ = container;
        cursor_.reset(*container_);
    }

    HRESULT KXSYS_CALL Next(ULONG count, T* elements, ULONG* fetched) override {
        return QVGuardedSlot([&]() -> HRESULT {
            if (elements == nullptr || (count != 1 && fetched == nullptr)) {
                return E_POINTER;
            }
            if (container_ == nullptr) {
                return E_FAIL;
            }
            const ULONG delivered = deliver(count, elements, fetched);
            if (fetched != nullptr) {
                *fetched = delivered;
            }
            return delivered < count ? S_FALSE : S_OK;
        });
    }

    HRESULT KXSYS_CALL Skip(ULONG count) override {
        if (container_ == nullptr) {
            return E_FAIL;
        }
        ULONG skipped = 0;
        for (; skipped < count && !cursor_.atEnd(*container_); ++skipped) {
            cursor_.advance(*container_);
        }
        return skipped < count ? S_FALSE : S_OK;
    }

    HRESULT KXSYS_CALL Reset() override {
        if (container_ == nullptr) {
            return E_FAIL;
        }
        cursor_.reset(*container_);
        return S_OK;
    }

    HRESULT KXSYS_CALL Clone(Base** copy) override;

  protected:
    IQVEnumOnSTLImpl() = default;
    virtual ~IQVEnumOnSTLImpl() = default;

    // Makes the enumerator the owner of `container` (it has no owner reference then).
    void Adopt(std::unique_ptr<const Container> container) noexcept {
        ownedContainer_ = std::move(container);
        Init(nullptr, ownedContainer_.get());
    }

  private:
    // A failure half-way gives back what this call delivered and leaves the position where
    // it was, so that a retry loses no element.
    ULONG deliver(ULONG count, T* elements, ULONG* fetched) {
        const QVEnumCursor<Container> start = cursor_;
        ULONG delivered = 0;
        try {
            for (; delivered < count && !cursor_.atEnd(*container_); ++delivered) {
                Copy::copy(&elements[delivered], cursor_.current(*container_));
                cursor_.advance(*container_);
            }
        } catch (...) {
            for (ULONG given = 0; given < delivered; ++given) {
                Copy::destroy(&elements[given]);
            }
            cursor_ = start;
            if (fetched != nullptr) {
                *fetched = 0;
            }
            throw;
        }
        return delivered;
    }

    // Destroyed in reverse order: an owned container goes first, then the owner reference.
    CQVComPtr<IUnknown> owner_;
    std::unique_ptr<const Container> ownedContainer_;
    const Container* container_ = nullptr;
    QVEnumCursor<Container> cursor_;
};

#endif
