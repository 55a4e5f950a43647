#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>
#include <new>

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

TEST(WinErrorTest, MissingFileGivesCode7AndTextWithoutFullStop) {
    errno = ENOENT;
    const WinError error("Mutex", 12);
    EXPECT_EQ(error.osErrorCode(), 2U);
    EXPECT_EQ(error.errorCode(), 7U);
    EXPECT_STREQ(error.what(), "No such file or directory");
    EXPECT_STREQ(error.file(), "Mutex");
}

TEST(WinErrorTest, ErrnoValuesReachTheirHostCodes) {
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
}

TEST(WinErrorTest, UnmappedErrnoStaysVisibleAndNeverHitsTheTable) {
    // EBUSY's own number, 16, is a different failure in the host's numbering.
    EXPECT_EQ(WinError::hostErrorNumber(EHOSTUNREACH), WinError::kUnmappedFlag | EHOSTUNREACH);
    EXPECT_EQ(WinError::codeOf(WinError::kUnmappedFlag | 2U), 42U);
}

TEST(WinErrorTest, LineEndAndTheFullStopBeforeItAreCut) {
    // The rule is applied to whatever text the system gives; Linux texts carry neither.
    for (int e = 1; e < 134; ++e) {
        const std::string text = WinError::messageOf(e);
        EXPECT_EQ(text.find_first_of("\r\n"), std::string::npos);
        EXPECT_FALSE(text.empty());
    }
}

TEST(SafeIntegerTest, AdditionUpToTheLimitAndNotBeyond) {
    std::uint32_t value = 0xFFFFFFF0u;
    SafeInteger::addAssign(value, 0xF);
    EXPECT_EQ(value, 0xFFFFFFFFu);
    try {
        SafeInteger::addAssign(value, 1);
        FAIL() << "no exception";
    } catch (const OutOfRange& e) {
        EXPECT_STREQ(e.file(), "SafeInteger");
        EXPECT_EQ(e.line(), 122U);
    }
    EXPECT_EQ(value, 0xFFFFFFFFu);
}

TEST(SafeIntegerTest, DoublingAbove0x7FFFFFFFThrows) {
    EXPECT_EQ(SafeInteger::doubled(0x7FFFFFFFu), 0xFFFFFFFEu);
    try {
        SafeInteger::doubled(0x80000000u);
        FAIL() << "no exception";
    } catch (const OutOfRange& e) {
        EXPECT_EQ(e.line(), 191U);
    }
}

TEST(NumericCastTest, NarrowingAbove32BitsThrows) {
    EXPECT_EQ(NumericCast::toU32(0xFFFFFFFFu), 0xFFFFFFFFu);
    try {
        NumericCast::toU32(0x100000000u);
        FAIL() << "no exception";
    } catch (const OutOfRange& e) {
        EXPECT_STREQ(e.file(), "NumericCast");
        EXPECT_EQ(e.line(), 67U);
    }
}
