#ifndef QV_PLATFORM_TASKMEMORY_H
#define QV_PLATFORM_TASKMEMORY_H

#include <cstddef>

namespace qv::dsc {

// The allocator whose blocks may cross the host boundary: a block allocated on one side is
// released on the other, so both sides use these three functions and nothing else.
// A null result for a non-zero size throws std::bad_alloc; on that failure of
// `reallocate` the old block is untouched and still belongs to the caller. On Windows
// (TaskMemoryWin32.cpp) the blocks are COM task memory (CoTaskMemAlloc/Realloc/Free).
class TaskMemory {
  public:
    static void* allocate(std::size_t size);
    static void* reallocate(void* block, std::size_t size);
    // Accepts null.
    static void release(void* block) noexcept;
};

}  // namespace qv::dsc

#endif
