#ifndef QV_PLATFORM_OLETEXT_H
#define QV_PLATFORM_OLETEXT_H

#include <cstddef>
#include <string>
#include <string_view>

namespace qv::dsc {

// The wide character of the host boundary (OLECHAR of qv1588/corbel.h): the system's own,
// wchar_t, on Windows, and char16_t elsewhere. Both hold UTF-16 code units.
#ifdef _WIN32
using OleChar = wchar_t;
#else
using OleChar = char16_t;
#endif
static_assert(sizeof(OleChar) == sizeof(char16_t));

// The one place where the library's text (char16_t: std::u16string, u"" literals) and the
// boundary's (OleChar) meet. The code units are copied one by one, never read through a
// pointer of the other type: on Windows the two types are distinct even though their bits
// are the same.
class OleText {
  public:
    // The library's text of a boundary text of `length` code units.
    static std::u16string toLibrary(const OleChar* text, std::size_t length) {
        std::u16string result(length, u'\0');
        for (std::size_t i = 0; i < length; ++i) {
            result[i] = static_cast<char16_t>(text[i]);
        }
        return result;
    }
    // Up to the NUL; null is the empty text.
    static std::u16string toLibrary(const OleChar* text) {
        return text == nullptr ? std::u16string()
                               : toLibrary(text, std::basic_string_view<OleChar>(text).size());
    }
    // Copies the code units of `text` to `target`, which has room for them.
    static void copy(std::u16string_view text, OleChar* target) {
        for (const char16_t unit : text) {
            *target++ = static_cast<OleChar>(unit);
        }
    }
    static std::basic_string<OleChar> toBoundary(std::u16string_view text) {
        std::basic_string<OleChar> result(text.size(), OleChar{});
        copy(text, result.data());
        return result;
    }
};

}  // namespace qv::dsc

#endif
