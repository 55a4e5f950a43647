#ifndef QV_PLATFORM_CODEPAGE_H
#define QV_PLATFORM_CODEPAGE_H

#include <cstdint>
#include <string>
#include <string_view>

#include "platform/BStr.h"

namespace qv::dsc {

// Conversion between wide text (UTF-16, see BStr.h) and narrow text in a character set
// named by a locale name. Four names are known, matched exactly, case included:
//   ""          the character set of the process's current locale (LC_CTYPE, as the
//               process has set it; the library never changes the locale), code page 0;
//   "US-ASCII"  ASCII, code page 20127;
//   "cp932"     the Japanese double-byte set CP932, code page 932;
//   "UTF-8"     UTF-8, code page 65001: the encoding of PTP texts on the wire, which every
//               wide text has (a lone surrogate still throws).
// Any other name throws qv::dsc::exception::InvalidLocale.
class CodePage {
  public:
    static constexpr std::uint32_t kCurrentLocale = 0;
    static constexpr std::uint32_t kUsAscii = 20127;
    static constexpr std::uint32_t kJapanese = 932;
    static constexpr std::uint32_t kUtf8 = 65001;

    // What becomes of narrow text that is not valid in its set.
    enum class tInvalidText {
        kReplace,  // each invalid sequence becomes U+FFFD, as texts from the network need
        kThrow,    // qv::dsc::osdep::WinError, for a caller that asks for strict conversion
    };

    static std::uint32_t idOf(std::string_view localeName);

    // A character that the narrow set cannot represent becomes '?'. Wide text that is not
    // valid UTF-16 (a lone surrogate) throws qv::dsc::osdep::WinError.
    static std::string wideToAnsi(std::u16string_view text, std::string_view localeName);
    static std::u16string ansiToWide(std::string_view text, std::string_view localeName,
                                     tInvalidText invalid = tInvalidText::kReplace);
};

inline std::string WideToAnsi(std::u16string_view text, std::string_view localeName) {
    return CodePage::wideToAnsi(text, localeName);
}
inline std::u16string AnsiToWide(
    std::string_view text, std::string_view localeName,
    CodePage::tInvalidText invalid = CodePage::tInvalidText::kReplace) {
    return CodePage::ansiToWide(text, localeName, invalid);
}

}  // namespace qv::dsc

#endif
