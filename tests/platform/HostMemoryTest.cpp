#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <limits>
#include <new>

#include "platform/BStr.h"
#include "platform/OutOfRange.h"
#include "platform/TaskMemory.h"

using qv::dsc::BSTR;
using qv::dsc::BStr;
using qv::dsc::TaskMemory;

// Under AddressSanitizer an impossible size must come back as null, as it does from the C
// library, instead of stopping the program: that null is what these tests are about.
extern "C" const char* __asan_default_options() {
    return "allocator_may_return_null=1";
}

TEST(TaskMemoryTest, ImpossibleSizesThrowBadAlloc) {
    const std::size_t huge = std::numeric_limits<std::size_t>::max() / 2;
    EXPECT_THROW(TaskMemory::allocate(huge), std::bad_alloc);
    void* block = TaskMemory::allocate(16);
    std::memset(block, 0xAB, 16);
    EXPECT_THROW(TaskMemory::reallocate(block, huge), std::bad_alloc);
    // The failed growth left the block with the caller, contents intact.
    EXPECT_EQ(static_cast<unsigned char*>(block)[15], 0xAB);
    block = TaskMemory::reallocate(block, 4096);
    EXPECT_EQ(static_cast<unsigned char*>(block)[15], 0xAB);
    TaskMemory::release(block);
    TaskMemory::release(nullptr);
}

TEST(BStrTest, CopyCarriesOctetLengthPrefixAndNul) {
    BSTR text = BStr::allocate(u"clock");
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(BStr::length(text), 5U);
    std::uint32_t prefix = 0;
    std::memcpy(&prefix, reinterpret_cast<const std::uint8_t*>(text) - 4, 4);
    EXPECT_EQ(prefix, 10U);  // octets, not characters
    EXPECT_EQ(text[5], 0);
    EXPECT_EQ(qv::dsc::OleText::toLibrary(text), u"clock");
    BStr::release(text);
}
