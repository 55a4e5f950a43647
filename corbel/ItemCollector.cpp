#include "corbel/ItemCollector.h"

namespace corbel {

HRESULT ItemCollector::QueryInterface(const IID& iid, void** object) {
    if (object == nullptr) {
        return E_POINTER;
    }
    // The collector's own identifier is the host's business; IUnknown is enough here.
    if (iid != IID_IUnknown) {
        *object = nullptr;
        return E_NOINTERFACE;
    }
    *object = static_cast<IUnknown*>(this);
    AddRef();
    return S_OK;
}

ULONG ItemCollector::AddRef() {
    return ++references_;
}

ULONG ItemCollector::Release() {
    return --references_;
}

HRESULT ItemCollector::ReservedCollector1() {
    return E_NOTIMPL;
}

HRESULT ItemCollector::ReservedCollector2() {
    return E_NOTIMPL;
}

HRESULT ItemCollector::AddItem(IkxSysPropertyBag* item) {
    if (item == nullptr) {
        return E_POINTER;
    }
    try {
        items_.push_back(readBag(*item));
    } catch (...) {  // nothing may cross back into the expert
        return E_OUTOFMEMORY;
    }
    return S_OK;
}

}  // namespace corbel
