#ifndef QV_EXPERT_QVGUARDEDSLOT_H
#define QV_EXPERT_QVGUARDEDSLOT_H

#include <new>

#include "qv1588/corbel.h"

// Runs the body of a host-callable operation so that no exception crosses the boundary:
// exhausted memory becomes E_OUTOFMEMORY, anything else E_FAIL.
template <class Body>
HRESULT QVGuardedSlot(Body&& body) noexcept {
    try {
        return body();
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    } catch (...) {
        return E_FAIL;
    }
}

#endif
