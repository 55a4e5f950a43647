#ifndef QV_EXPERT_CQVCOMOBJECTROOTBASE_H
#define QV_EXPERT_CQVCOMOBJECTROOTBASE_H

#include <span>

#include "qv1588/corbel.h"

// One row of a class's interface table: an identifier that the object answers and how to
// reach that interface from the object (`object` points at the class itself).
struct QVInterfaceEntry {
    const IID* iid;
    void* (*cast)(void* object) noexcept;
};

template <class T, class I>
void* QVInterfaceCast(void* object) noexcept {
    return static_cast<I*>(static_cast<T*>(object));
}

// The row that answers `iid` with T's base interface I.
template <class T, class I>
constexpr QVInterfaceEntry QVInterface(const IID& iid) {
    return QVInterfaceEntry{&iid, &QVInterfaceCast<T, I>};
}

// What every host object has in common, whatever its counting: the construction hook and
// the lookup in its interface table. A class completed by CQVComObject names its table in a
// static `InterfaceTable()`; the first row also answers IUnknown.
class CQVComObjectRootBase {
  public:
    CQVComObjectRootBase(const CQVComObjectRootBase&) = delete;
    CQVComObjectRootBase& operator=(const CQVComObjectRootBase&) = delete;

    // Runs once the object is built, before its creator takes the first reference; a class
    // that needs a fallible second step hides it. A failure ends the creation with its code.
    HRESULT FinishConstruction() { return S_OK; }

    // Writes the interface that answers `iid` to `out` (null and E_NOINTERFACE when none
    // does). Adds no reference: the caller does, on success.
    static HRESULT InternalQueryInterface(void* object, std::span<const QVInterfaceEntry> table,
                                          const IID& iid, void** out) noexcept;

  protected:
    CQVComObjectRootBase() = default;
    ~CQVComObjectRootBase() = default;
};

#endif
