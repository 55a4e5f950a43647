#ifndef QV_CORBEL_WIDETEXT_H
#define QV_CORBEL_WIDETEXT_H

#include <qv1588/corbel.h>

#include <string>
#include <string_view>

namespace corbel {

// The boundary speaks UTF-16 in its own character type (OLECHAR: wchar_t on Windows), the
// terminal and JSON UTF-8. Malformed input in either direction becomes U+FFFD instead of
// failing: a clock's text must never end a listing.
std::basic_string<OLECHAR> toUtf16(std::string_view text);
std::string toUtf8(std::basic_string_view<OLECHAR> text);

// Owns a BSTR that the expert handed out and frees it with SysFreeString.
class OwnedBstr {
  public:
    OwnedBstr() = default;
    ~OwnedBstr() { SysFreeString(text_); }
    OwnedBstr(const OwnedBstr&) = delete;
    OwnedBstr& operator=(const OwnedBstr&) = delete;

    // For an out parameter: frees what is held first.
    BSTR* out();
    // The text in UTF-8; a null BSTR is the empty text.
    std::string utf8() const;

  private:
    BSTR text_ = nullptr;
};

}  // namespace corbel

#endif
