#include <gtest/gtest.h>

#include <cerrno>

#include "platform/NumericCast.h"
#include "platform/OutOfRange.h"
#include "platform/SafeInteger.h"
#include "platform/WinError.h"

using qv::dsc::NumericCast;
using qv::dsc::SafeInteger;
using qv::dsc::exception::OutOfRange;
using qv::dsc::osdep::WinError;

TEST(WinErrorTest, ErrnoValuesReachTheirHostCodes) {
    errno = ENOENT;
    const WinError missing("Mutex", 12);
    EXPECT_EQ(missing.osErrorCode(), 2U);
    EXPECT_EQ(missing.errorCode(), 7U);
    EXPECT_STREQ(missing.what(), "No such file or directory");
    EXPECT_STREQ(missing.file(), "Mutex");
    struct {
        int posixError;
        std::uint32_t code;
    } const cases[] = {
        {0, 0},
        {ENOTDIR, 7},
        {EMFILE, 11},
        {EACCES, 0x80070005u},
        {EPERM, 0x80070005u},
        {EBADF, 1},
        {EINVAL, 1},
        {ENOMEM, 2},
        {EROFS, 8},
        {EEXIST, static_cast<std::uint32_t>(-98)},
        {EAGAIN, 8},
        {ELOOP, 42},
        {EHOSTUNREACH, 42},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(WinError(c.posixError, "f", 1).errorCode(), c.code) << c.posixError;
    }
    // EHOSTUNREACH's own number, 113, must not be read as a host error number.
    EXPECT_EQ(WinError::hostErrorNumber(EHOSTUNREACH), WinError::kUnmappedFlag | EHOSTUNREACH);
    EXPECT_EQ(WinError::codeOf(WinError::kUnmappedFlag | 2U), 42U);
}

// Arithmetic that would not fit throws OutOfRange and leaves the value.
TEST(OutOfRangeTest, OverflowsThrow) {
    std::uint32_t value = 0xFFFFFFF0u;
    SafeInteger::addAssign(value, 0xF);
    EXPECT_THROW(SafeInteger::addAssign(value, 1), OutOfRange);
    EXPECT_EQ(value, 0xFFFFFFFFu);
    EXPECT_EQ(SafeInteger::doubled(0x7FFFFFFFu), 0xFFFFFFFEu);
    EXPECT_THROW(SafeInteger::doubled(0x80000000u), OutOfRange);
    EXPECT_EQ(NumericCast::toU32(0xFFFFFFFFu), 0xFFFFFFFFu);
    EXPECT_THROW(NumericCast::toU32(0x100000000u), OutOfRange);
}
