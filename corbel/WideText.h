#ifndef QV_CORBEL_WIDETEXT_H
#define QV_CORBEL_WIDETEXT_H

#include <qv1588/corbel.h>

#include <string>
#include <string_view>

namespace corbel {

// The boundary speaks UTF-16, the terminal and JSON UTF-8. Malformed input in either
// direction becomes U+FFFD instead of failing: a clock's text must never end a listing.
std::u16string toUtf16(std::string_view text);
std::string toUtf8(std::u16string_view text);

// Frees a BSTR that the expert handed out: its block begins at the four-octet length prefix
// and comes from the C library's malloc, which the program and the library share.
void freeString(BSTR text);

// Owns a BSTR that the expert handed out.
class OwnedBstr {
  public:
    OwnedBstr() = default;
    ~OwnedBstr() { freeString(text_); }
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
