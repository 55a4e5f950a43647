#include <gtest/gtest.h>

#include <string>

#include "platform/CodePage.h"
#include "platform/InvalidLocale.h"
#include "platform/WinError.h"

using qv::dsc::CodePage;
using qv::dsc::exception::InvalidLocale;
using qv::dsc::osdep::WinError;

TEST(CodePageTest, KnownNamesAreMatchedExactly) {
    EXPECT_EQ(CodePage::idOf(""), 0U);
    EXPECT_EQ(CodePage::idOf("US-ASCII"), 20127U);
    EXPECT_EQ(CodePage::idOf("cp932"), 932U);
    EXPECT_EQ(CodePage::idOf("UTF-8"), 65001U);
    for (const char* name : {"CP932", "us-ascii", "utf-8", "cp932 "}) {
        try {
            CodePage::idOf(name);
            ADD_FAILURE() << name;
        } catch (const InvalidLocale& e) {
            EXPECT_EQ(e.errorCode(), 0x8ABC7024u);
            EXPECT_STREQ(e.file(), "_GetCodePageID");
            EXPECT_EQ(e.line(), 58U);
        }
    }
    EXPECT_THROW(qv::dsc::WideToAnsi(u"x", "CP932"), InvalidLocale);
}

TEST(CodePageTest, TextConvertsBothWaysAndUnrepresentableBecomesQuestionMark) {
    // "日本語 1588": Shift_JIS double-byte codes 93FA 967B 8CEA, then ASCII.
    const std::u16string japanese = u"\u65E5\u672C\u8A9E 1588";
    const std::string expected = "\x93\xFA\x96\x7B\x8C\xEA 1588";
    const std::string narrow = qv::dsc::WideToAnsi(japanese, "cp932");
    EXPECT_EQ(narrow, expected);
    EXPECT_EQ(qv::dsc::AnsiToWide(narrow, "cp932"), japanese);
    // "Zürich – 東京" in UTF-8: ü C3 BC, en dash E2 80 93, 東 E6 9D B1, 京 E4 BA AC; and
    // U+1F600 as F0 9F 98 80.
    const std::u16string zurich = u"Z\u00FCrich \u2013 \u6771\u4EAC \U0001F600";
    const std::string utf8 = "Z\xC3\xBCrich \xE2\x80\x93 \xE6\x9D\xB1\xE4\xBA\xAC \xF0\x9F\x98\x80";
    EXPECT_EQ(qv::dsc::WideToAnsi(zurich, "UTF-8"), utf8);
    EXPECT_EQ(qv::dsc::AnsiToWide(utf8, "UTF-8"), zurich);
    // U+65E5 and the pair D83D DE00 (one character outside the basic plane) are not ASCII.
    EXPECT_EQ(qv::dsc::WideToAnsi(u"a\u65E5b\U0001F600c", "US-ASCII"), "a?b?c");
    EXPECT_EQ(qv::dsc::WideToAnsi(u"", "cp932"), "");
    EXPECT_EQ(qv::dsc::AnsiToWide("", ""), u"");
}

TEST(CodePageTest, MalformedInputThrowsOnlyWhenStrict) {
    const char16_t loneSurrogate[] = {u'a', 0xD800, u'b'};
    EXPECT_THROW(qv::dsc::WideToAnsi(std::u16string_view(loneSurrogate, 3), "cp932"), WinError);
    EXPECT_THROW(qv::dsc::WideToAnsi(std::u16string_view(loneSurrogate, 3), "UTF-8"), WinError);
    // 0x81 opens a double-byte code that never comes.
    constexpr auto strict = qv::dsc::CodePage::tInvalidText::kThrow;
    EXPECT_THROW(qv::dsc::AnsiToWide("ab\x81", "cp932", strict), WinError);
    EXPECT_THROW(qv::dsc::AnsiToWide("\xC3", "US-ASCII", strict), WinError);
    // Texts from clocks never fail a read, also in a host that runs in ASCII.
    EXPECT_EQ(qv::dsc::AnsiToWide("caf\xC3\xA9", "US-ASCII"), u"caf\uFFFD\uFFFD");
    // 0x81 0x20 is no double-byte code; the last 0x81 is cut short by the end.
    EXPECT_EQ(qv::dsc::AnsiToWide("a\x81 b\x81", "cp932"), u"a\uFFFD b\uFFFD");
}
