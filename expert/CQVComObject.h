#ifndef QV_EXPERT_CQVCOMOBJECT_H
#define QV_EXPERT_CQVCOMOBJECT_H

#include "expert/CQVComObjectRootBase.h"
#include "qv1588/corbel.h"

// The creatable completion of a host class Base: IUnknown from Base's interface table and
// its counting root, and the deleting destructor.
//
// Contract: an object lives while it has references. CreateInstance returns it with none,
// so the creator adds the first (CQVComPtr does). Every interface pointer handed out
// through an out parameter carries one reference; its receiver gives it back with Release,
// and the Release that takes the count to 0 deletes the object. AddRef and Release are
// atomic and may come from any thread.
template <class Base>
class CQVComObject final : public Base {
  public:
    // Null with E_OUTOFMEMORY when the allocation fails or Base's constructor throws, null
    // with the hook's code when its construction hook fails.
    static HRESULT CreateInstance(CQVComObject** object) noexcept {
        if (object == nullptr) {
            return E_POINTER;
        }
        *object = nullptr;
        CQVComObject* created = nullptr;
        try {
            created = new CQVComObject();
        } catch (...) {
            return E_OUTOFMEMORY;
        }
        HRESULT result = E_OUTOFMEMORY;
        try {
            result = created->FinishConstruction();
        } catch (...) {
        }
        if (FAILED(result)) {
            delete created;
            return result;
        }
        *object = created;
        return S_OK;
    }

    // Creates the object and hands it out as its interface I with one reference for the
    // caller; on failure `*object` is null and the code is CreateInstance's.
    template <class I>
    static HRESULT CreateReferenced(I** object) noexcept {
        if (object == nullptr) {
            return E_POINTER;
        }
        *object = nullptr;
        CQVComObject* created = nullptr;
        const HRESULT result = CreateInstance(&created);
        if (SUCCEEDED(result)) {
            created->AddRef();
            *object = created;
        }
        return result;
    }

    HRESULT KXSYS_CALL QueryInterface(const IID& iid, void** out) override {
        const HRESULT result = CQVComObjectRootBase::InternalQueryInterface(
            static_cast<Base*>(this), Base::InterfaceTable(), iid, out);
        if (SUCCEEDED(result)) {
            AddRef();
        }
        return result;
    }
    ULONG KXSYS_CALL AddRef() override { return this->InternalAddRef(); }
    ULONG KXSYS_CALL Release() override {
        const ULONG remaining = this->InternalRelease();
        if (remaining == 0) {
            delete this;
        }
        return remaining;
    }

    // A reference taken and given back while Base is torn down must not delete it twice.
    ~CQVComObject() { this->count_ = 1; }

  private:
    CQVComObject() = default;
};

#endif
