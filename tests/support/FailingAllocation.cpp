#include "tests/support/FailingAllocation.h"

#include <cstdlib>
#include <new>

namespace {

thread_local unsigned allocationsBeforeFailure = 0;  // 0: no failure planned
thread_local bool failureTriggered = false;

void* allocate(std::size_t size) {
    if (allocationsBeforeFailure != 0 && --allocationsBeforeFailure == 0) {
        failureTriggered = true;
        throw std::bad_alloc();
    }
    if (void* p = std::malloc(size == 0 ? 1 : size)) {
        return p;
    }
    throw std::bad_alloc();
}

void* allocateOrNull(std::size_t size) noexcept {
    try {
        return allocate(size);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

}  // namespace

namespace qvtest {

ScopedAllocationFailure::ScopedAllocationFailure(unsigned nth) {
    failureTriggered = false;
    allocationsBeforeFailure = nth;
}

ScopedAllocationFailure::~ScopedAllocationFailure() {
    allocationsBeforeFailure = 0;
}

bool ScopedAllocationFailure::triggered() const {
    return failureTriggered;
}

AllocationFailurePause::AllocationFailurePause() : saved_(allocationsBeforeFailure) {
    allocationsBeforeFailure = 0;
}

AllocationFailurePause::~AllocationFailurePause() {
    allocationsBeforeFailure = saved_;
}

}  // namespace qvtest

// clang-format off
void* operator new(std::size_t size) { return allocate(size); }
void* operator new[](std::size_t size) { return allocate(size); }
void* operator new(std::size_t n, const std::nothrow_t&) noexcept { return allocateOrNull(n); }
void* operator new[](std::size_t n, const std::nothrow_t&) noexcept { return allocateOrNull(n); }
void operator delete(void* p) noexcept { std::free(p); }
void operator delete[](void* p) noexcept { std::free(p); }
void operator delete(void* p, std::size_t) noexcept { std::free(p); }
void operator delete[](void* p, std::size_t) noexcept { std::free(p); }
// clang-format on
