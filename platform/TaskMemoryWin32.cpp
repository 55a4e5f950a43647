#include <windows.h>
// After windows.h, which it needs.
#include <objbase.h>

#include <new>

#include "platform/TaskMemory.h"

namespace qv::dsc {

// Windows backend: COM task memory, which a host releases with CoTaskMemFree.

void* TaskMemory::allocate(std::size_t size) {
    void* block = CoTaskMemAlloc(size);
    if (block == nullptr && size != 0) {
        throw std::bad_alloc();
    }
    return block;
}

void* TaskMemory::reallocate(void* block, std::size_t size) {
    if (size == 0) {
        // Shrinking to nothing releases the block; a null result is then no failure.
        CoTaskMemFree(block);
        return nullptr;
    }
    void* grown = CoTaskMemRealloc(block, size);
    if (grown == nullptr) {
        throw std::bad_alloc();
    }
    return grown;
}

void TaskMemory::release(void* block) noexcept {
    CoTaskMemFree(block);
}

}  // namespace qv::dsc
