#include <gtest/gtest.h>

#include <string>

#include "platform/CodePage.h"

namespace {

// Texts from clocks never fail a read: what the set cannot decode becomes U+FFFD. The
// test program never calls setlocale, so "" is ASCII here as in such a host.
TEST(LenientText, InvalidSequencesBecomeReplacementCharacters) {
    const struct {
        const char* narrow;
        const char* locale;
        std::u16string wide;
    } cases[] = {
        {"caf\xC3\xA9", "", u"caf\uFFFD\uFFFD"},
        {"caf\xC3\xA9", "US-ASCII", u"caf\uFFFD\uFFFD"},
        {"a\x81 b", "cp932", u"a\uFFFD b"},  // 0x81 0x20 is no double-byte code
        {"ab\x81", "cp932", u"ab\uFFFD"},    // cut short by the end
    };
    for (const auto& c : cases) {
        EXPECT_EQ(qv::dsc::AnsiToWide(c.narrow, c.locale), c.wide) << c.narrow << " " << c.locale;
    }
}

}  // namespace
