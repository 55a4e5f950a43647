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
    EXPECT_EQ(text[5], u'\0');
    EXPECT_EQ(std::u16string(text), u"clock");
    BStr::release(text);
}

TEST(BStrTest, EmbeddedNulCountsAndNullIsTheEmptyString) {
    const char16_t withNul[] = {u'a', u'\0', u'b'};
    BSTR text = BStr::allocate(withNul, 3);
    EXPECT_EQ(BStr::length(text), 3U);
    EXPECT_EQ(text[2], u'b');
    BStr::release(text);

    EXPECT_EQ(BStr::allocate(nullptr), nullptr);
    EXPECT_EQ(BStr::length(nullptr), 0U);
    BStr::release(nullptr);

    BSTR empty = BStr::allocate(u"");
    ASSERT_NE(empty, nullptr);
    EXPECT_EQ(BStr::length(empty), 0U);
    BStr::release(empty);
}

TEST(BStrTest, LengthWhoseOctetCountOverflowsThrows) {
    EXPECT_THROW(BStr::allocate(nullptr, 0x80000000u), qv::dsc::exception::OutOfRange);
    EXPECT_THROW(BStr::allocate(nullptr, 0x7FFFFFFEu), qv::dsc::exception::OutOfRange);
}
