#include "platform/TaskMemory.h"

#include <cstdlib>
#include <new>

namespace qv::dsc {

void* TaskMemory::allocate(std::size_t size) {
    void* block = std::malloc(size);
    if (block == nullptr && size != 0) {
        throw std::bad_alloc();
    }
    return block;
}

void* TaskMemory::reallocate(void* block, std::size_t size) {
    if (size == 0) {
        // Shrinking to nothing releases the block; a null result is then no failure.
        std::free(block);
        return nullptr;
    }
    void* grown = std::realloc(block, size);
    if (grown == nullptr) {
        throw std::bad_alloc();
    }
    return grown;
}

void TaskMemory::release(void* block) noexcept {
    std::free(block);
}

}  // namespace qv::dsc
