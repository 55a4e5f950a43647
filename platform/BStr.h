#ifndef QV_PLATFORM_BSTR_H
#define QV_PLATFORM_BSTR_H

#include <cstdint>
#include <string_view>

#include "platform/OleText.h"

namespace qv::dsc {

// The library's wide character: UTF-16 code units. Conversion to and from narrow text
// happens at the edges (AnsiToWide, WideToAnsi), to and from the host boundary's OleChar
// in OleText.
using WideChar = char16_t;

// A host string: pointer to the first of `length` UTF-16 code units followed by a NUL, with
// the length in octets stored in the four octets before it. The side that receives one
// owns it and releases it with SysFreeString; inside the library BStr::release is the one
// release. A null BSTR is a valid empty string.
//
// One allocator per platform: on POSIX (BStr.cpp) the C library's malloc, which the public
// header's inline SysFreeString gives back; on Windows (BStrWin32.cpp) the system's strings
// of oleaut32 (SysAllocStringLen, SysFreeString), whoever allocated them.
using BSTR = OleChar*;

class BStr {
  public:
    // A new BSTR with the library's text (embedded NULs included).
    static BSTR allocate(std::u16string_view text);
    // A copy of a boundary text up to its NUL; null gives null.
    static BSTR copy(const OleChar* text);
    // A copy of `length` code units of a boundary text (NULs included); `text` may be null
    // only when `length` is 0.
    static BSTR copy(const OleChar* text, std::uint32_t length);
    // Accepts null.
    static void release(BSTR text) noexcept;
    // Code units, from the prefix: embedded NULs count; null has length 0.
    static std::uint32_t length(const OleChar* text) noexcept;

  private:
    // A new BSTR of `length` code units whose contents the caller fills; the NUL after
    // them is set. Throws std::bad_alloc, or OutOfRange when the block size passes 32 bits.
    static BSTR allocateUnits(std::uint32_t length);
};

}  // namespace qv::dsc

#endif
