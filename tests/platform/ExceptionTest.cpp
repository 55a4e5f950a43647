#include <gtest/gtest.h>

#include <cerrno>
#include <functional>

#include "platform/InvalidLocale.h"
#include "platform/NumericCast.h"
#include "platform/OutOfRange.h"
#include "platform/SafeInteger.h"
#include "platform/WinError.h"

using qv::dsc::NumericCast;
using qv::dsc::SafeInteger;
using qv::dsc::exception::Exception;
using qv::dsc::exception::InvalidLocale;
using qv::dsc::exception::OutOfRange;
using qv::dsc::osdep::OSException;
using qv::dsc::osdep::WinError;

TEST(ExceptionTest, EachTypeHasItsTextAndCodeThroughTheBase) {
    const Exception base("a.cpp", 3);
    const OutOfRange range("SafeInteger", 122);
    const InvalidLocale locale("_GetCodePageID", 58);
    const OSException os;
    const Exception* all[] = {&base, &range, &locale, &os};
    const char* texts[] = {"unspecified exception", "Out of range", "Invalid locale",
                           "Unknown error"};
    const std::uint32_t codes[] = {0xFFFFFFFFu, 0x8ABC7007u, 0x8ABC7024u, 42};
    for (int i = 0; i < 4; ++i) {
        EXPECT_STREQ(all[i]->what(), texts[i]);
        EXPECT_EQ(all[i]->errorCode(), codes[i]);
    }
    EXPECT_STREQ(range.file(), "SafeInteger");
    EXPECT_EQ(range.line(), 122U);
    EXPECT_EQ(os.osErrorCode(), 0U);
}

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

// Arithmetic that would not fit throws OutOfRange naming where, and leaves the value.
TEST(OutOfRangeTest, OverflowsThrowNamingTheirSource) {
    std::uint32_t value = 0xFFFFFFF0u;
    SafeInteger::addAssign(value, 0xF);
    EXPECT_EQ(value, 0xFFFFFFFFu);
    EXPECT_EQ(SafeInteger::doubled(0x7FFFFFFFu), 0xFFFFFFFEu);
    EXPECT_EQ(NumericCast::toU32(0xFFFFFFFFu), 0xFFFFFFFFu);
    struct {
        std::function<void()> overflow;
        const char* file;
        unsigned line;
    } const cases[] = {
        {[&] { SafeInteger::addAssign(value, 1); }, "SafeInteger", 122},
        {[] { SafeInteger::doubled(0x80000000u); }, "SafeInteger", 191},
        {[] { NumericCast::toU32(0x100000000u); }, "NumericCast", 67},
    };
    for (const auto& c : cases) {
        try {
            c.overflow();
            ADD_FAILURE() << "no exception from " << c.file << ":" << c.line;
        } catch (const OutOfRange& e) {
            EXPECT_STREQ(e.file(), c.file);
            EXPECT_EQ(e.line(), c.line);
        }
    }
    EXPECT_EQ(value, 0xFFFFFFFFu);
}
