#include <windows.h>
// After windows.h, which it needs.
#include <oleauto.h>

#include <gtest/gtest.h>

#include <cstdlib>

#include "platform/BStr.h"
#include "platform/CodePage.h"
#include "platform/LocalDateTime.h"
#include "platform/OutOfRange.h"
#include "platform/TaskMemory.h"
#include "platform/WinError.h"

using qv::dsc::BStr;
using qv::dsc::TaskMemory;
using qv::dsc::osdep::WinError;

TEST(BStrWin32Test, StringsCrossTheBoundaryBothWays) {
    // Ours released by the host's SysFreeString, the host's released by ours.
    ::BSTR ours = BStr::allocate(std::u16string_view(u"a\0b", 3));
    EXPECT_EQ(SysStringLen(ours), 3U);
    EXPECT_EQ(SysStringByteLen(ours), 6U);
    EXPECT_EQ(ours[2], L'b');
    SysFreeString(ours);
    ::BSTR theirs = SysAllocString(L"host");
    EXPECT_EQ(BStr::length(theirs), 4U);
    BStr::release(theirs);
}

TEST(TaskMemoryWin32Test, BlocksAreTheHostsTaskMemory) {
    void* ours = TaskMemory::allocate(16);
    CoTaskMemFree(ours);
    void* theirs = CoTaskMemAlloc(16);
    theirs = TaskMemory::reallocate(theirs, 4096);
    ASSERT_NE(theirs, nullptr);
    TaskMemory::release(theirs);
}

TEST(WinErrorWin32Test, SystemErrorNumbersReachTheirCodesWithTheSystemsText) {
    const struct {
        DWORD error;
        std::uint32_t code;
    } cases[] = {{ERROR_FILE_NOT_FOUND, 7},
                 {ERROR_ACCESS_DENIED, 0x80070005u},
                 {ERROR_INVALID_PARAMETER, 1},
                 {ERROR_NOT_ENOUGH_MEMORY, 2}};
    for (const auto& c : cases) {
        SetLastError(c.error);
        const WinError error("Mutex", 1);
        EXPECT_EQ(error.osErrorCode(), c.error);
        EXPECT_EQ(error.errorCode(), c.code) << c.error;
        const std::string text = error.what();
        EXPECT_FALSE(text.empty());
        EXPECT_EQ(text.find_first_of("\r\n"), text.npos) << text;
    }
}

TEST(LocalDateTimeWin32Test, LocalTimeRoundTripsAndTheRunTimesLimitsAreOutOfRange) {
    // 2021-06-01 12:00:00 in the process's zone, whatever it is, and back.
    qv::dsc::CalendarTime noon;
    noon.yearsSince1900 = 121;
    noon.month = 5;
    noon.hour = 12;
    const qv::dsc::CalendarTime back =
        qv::dsc::LocalDateTime::fromAbsTime(qv::dsc::LocalDateTime::toAbsTime(noon));
    EXPECT_EQ(back.yearsSince1900, 121);
    EXPECT_EQ(back.month, 5);
    EXPECT_EQ(back.dayOfMonth, 1);
    EXPECT_EQ(back.hour, 12);
    EXPECT_EQ(back.weekday, 2);  // a Tuesday

    qv::dsc::CalendarTime early;
    early.yearsSince1900 = 69;
    EXPECT_THROW(qv::dsc::LocalDateTime::toAbsTime(early), qv::dsc::exception::OutOfRange);
    qv::dsc::CalendarTime distant = noon;
    distant.yearsSince1900 = 10000 - 1900;
    EXPECT_THROW(qv::dsc::LocalDateTime::toAbsTime(distant), qv::dsc::exception::OutOfRange);
}

TEST(CodePageWin32Test, InvalidNarrowTextBecomesReplacementsUnlessStrict) {
    // The named sets behave as on every platform; "" is the system's ANSI code page here.
    const struct {
        const char* narrow;
        const char* locale;
        std::u16string wide;
    } cases[] = {
        {"caf\xC3\xA9", "US-ASCII", u"caf\uFFFD\uFFFD"},
        {"a\x81 b", "cp932", u"a\uFFFD b"},
        {"ab\x81", "cp932", u"ab\uFFFD"},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(qv::dsc::AnsiToWide(c.narrow, c.locale), c.wide) << c.narrow;
        EXPECT_THROW(
            qv::dsc::AnsiToWide(c.narrow, c.locale, qv::dsc::CodePage::tInvalidText::kThrow),
            WinError);
    }
}
