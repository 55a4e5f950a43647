#ifndef QV_EXPERT_QVCREATEENUMERATOR_H
#define QV_EXPERT_QVCREATEENUMERATOR_H

#include <memory>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "qv1588/corbel.h"

// New enumerators for the host, each standing on its first element and carrying one
// reference for the caller in `*enumerator` (null on failure, with the creation's code).

template <class Enumerator, class Interface, class Setup>
HRESULT QVCreateEnumeratorWith(Interface** enumerator, Setup&& setup) noexcept {
    if (enumerator == nullptr) {
        return E_POINTER;
    }
    *enumerator = nullptr;
    CQVComObject<Enumerator>* created = nullptr;
    const HRESULT creation = CQVComObject<Enumerator>::CreateInstance(&created);
    if (FAILED(creation)) {
        return creation;
    }
    CQVComPtr<CQVComObject<Enumerator>> held(created);
    setup(*created);
    *enumerator = held.Detach();
    return S_OK;
}

// Over a container that the enumerator takes over (an item-name list, an accepted-tag set).
template <class Enumerator, class Interface>
HRESULT QVCreateOwningEnumerator(std::unique_ptr<const typename Enumerator::ContainerType> elements,
                                 Interface** enumerator) noexcept {
    return QVCreateEnumeratorWith<Enumerator>(
        enumerator, [&](Enumerator& created) noexcept { created.Adopt(std::move(elements)); });
}

// Over a container that `owner` keeps alive; the enumerator holds a reference to `owner`.
template <class Enumerator, class Interface>
HRESULT QVCreateEnumerator(IUnknown* owner, const typename Enumerator::ContainerType& elements,
                           Interface** enumerator) noexcept {
    return QVCreateEnumeratorWith<Enumerator>(
        enumerator, [&](Enumerator& created) noexcept { created.Init(owner, &elements); });
}

#endif
