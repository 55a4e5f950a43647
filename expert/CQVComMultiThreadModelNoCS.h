#ifndef QV_EXPERT_CQVCOMMULTITHREADMODELNOCS_H
#define QV_EXPERT_CQVCOMMULTITHREADMODELNOCS_H

#include <atomic>

#include "qv1588/corbel.h"

// Counting for objects that any thread may reference but only one thread uses at a time:
// the count changes atomically, and there is no lock for the object's own state.
struct CQVComMultiThreadModelNoCS {
    static ULONG Increment(std::atomic<ULONG>& count) noexcept { return ++count; }
    static ULONG Decrement(std::atomic<ULONG>& count) noexcept { return --count; }
};

#endif
