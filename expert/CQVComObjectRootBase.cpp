#include "expert/CQVComObjectRootBase.h"

HRESULT CQVComObjectRootBase::InternalQueryInterface(void* object,
                                                     std::span<const QVInterfaceEntry> table,
                                                     const IID& iid, void** out) noexcept {
    if (out == nullptr) {
        return E_POINTER;
    }
    *out = nullptr;
    if (table.empty()) {
        return E_NOINTERFACE;
    }
    if (iid == IID_IUnknown) {
        *out = table.front().cast(object);
        return S_OK;
    }
    for (const QVInterfaceEntry& entry : table) {
        if (*entry.iid == iid) {
            *out = entry.cast(object);
            return S_OK;
        }
    }
    return E_NOINTERFACE;
}
