#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "platform/CodePage.h"
#include "platform/InvalidLocale.h"
#include "platform/StringBase.h"
#include "platform/WinError.h"

using qv::dsc::CodePage;
using qv::dsc::String;
using qv::dsc::WString;
using qv::dsc::exception::InvalidLocale;
using qv::dsc::osdep::WinError;

// A shorter text keeps the buffer while it fills at least half of it; otherwise the buffer
// is replaced by one of exactly the new length.
TEST(StringBaseTest, AssignmentKeepsOrReplacesTheBuffer) {
    struct Case {
        const char* before;
        const char* after;
        std::size_t capacity;
        bool sameBuffer;
    } const cases[] = {
        {"0123456789abcdef", "0123456789", 16, true},                   // full enough
        {"0123456789abcdef0123456789abcdef", "0123456789", 10, false},  // mostly empty
        {"abc", "abcdefgh", 8, false},                                  // longer
    };
    for (const Case& c : cases) {
        String text(c.before);
        ASSERT_EQ(text.capacity(), std::strlen(c.before));
        const char* before = text.c_str();
        text = c.after;
        EXPECT_EQ(text.c_str() == before, c.sameBuffer) << c.before;
        EXPECT_EQ(text.capacity(), c.capacity) << c.before;
        EXPECT_EQ(text.length(), std::strlen(c.after));
        EXPECT_STREQ(text.c_str(), c.after);
    }
}

TEST(StringBaseTest, NullEmptyCopyAndSelfAssignment) {
    const String none(static_cast<const char*>(nullptr));
    EXPECT_TRUE(none.empty());
    EXPECT_STREQ(none.c_str(), "");
    String text("clock");
    const String copy(text);
    EXPECT_NE(copy.c_str(), text.c_str());
    EXPECT_EQ(copy, text);
    text.assign(text.c_str() + 1, 3);  // a source inside its own buffer
    EXPECT_STREQ(text.c_str(), "loc");
    const char range[] = "xyz";
    EXPECT_STREQ(String(range, range + 2).c_str(), "xy");
}

TEST(StringBaseTest, OtherWidthConvertsThroughTheCurrentLocale) {
    const WString wide(String("PTP clock"));
    EXPECT_EQ(std::u16string(wide.view()), u"PTP clock");
    EXPECT_STREQ(String(wide).c_str(), "PTP clock");
}

TEST(CodePageTest, KnownNamesAreMatchedExactly) {
    EXPECT_EQ(CodePage::idOf(""), 0U);
    EXPECT_EQ(CodePage::idOf("US-ASCII"), 20127U);
    EXPECT_EQ(CodePage::idOf("cp932"), 932U);
    for (const char* name : {"CP932", "us-ascii", "UTF-8", "cp932 "}) {
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

TEST(CodePageTest, JapaneseTextRoundTripsThroughCp932) {
    // "日本語 1588": Shift_JIS double-byte codes 93FA 967B 8CEA, then ASCII.
    const std::u16string japanese = u"\u65E5\u672C\u8A9E 1588";
    const std::string expected = "\x93\xFA\x96\x7B\x8C\xEA 1588";
    const std::string narrow = qv::dsc::WideToAnsi(japanese, "cp932");
    EXPECT_EQ(narrow, expected);
    EXPECT_EQ(qv::dsc::AnsiToWide(narrow, "cp932"), japanese);
}

TEST(CodePageTest, UnrepresentableCharacterBecomesQuestionMark) {
    // U+65E5 and the pair D83D DE00 (one character outside the basic plane) are not ASCII.
    EXPECT_EQ(qv::dsc::WideToAnsi(u"a\u65E5b\U0001F600c", "US-ASCII"), "a?b?c");
}

TEST(CodePageTest, MalformedInputThrowsWinError) {
    const char16_t loneSurrogate[] = {u'a', 0xD800, u'b'};
    EXPECT_THROW(qv::dsc::WideToAnsi(std::u16string_view(loneSurrogate, 3), "cp932"), WinError);
    // 0x81 opens a double-byte code that never comes.
    constexpr auto strict = qv::dsc::CodePage::tInvalidText::kThrow;
    EXPECT_THROW(qv::dsc::AnsiToWide("ab\x81", "cp932", strict), WinError);
    EXPECT_THROW(qv::dsc::AnsiToWide("\xC3", "US-ASCII", strict), WinError);
}

TEST(CodePageTest, EmptyTextGivesEmptyResult) {
    EXPECT_EQ(qv::dsc::WideToAnsi(u"", "cp932"), "");
    EXPECT_EQ(qv::dsc::AnsiToWide("", ""), u"");
}
