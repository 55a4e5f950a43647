#ifndef QV_PLATFORM_BSTR_H
#define QV_PLATFORM_BSTR_H

#include <cstdint>

namespace qv::dsc {

// The wide character of the host boundary is char16_t: UTF-16 code units, the encoding of
// the host's strings. Every wide text that crosses the boundary uses it; conversion to and
// from narrow text happens at the edges (AnsiToWide, WideToAnsi).
using WideChar = char16_t;

// A host string: pointer to the first of `length` UTF-16 code units followed by a NUL, with
// the length in octets stored in the four octets before it. The side that receives one
// owns it and releases it with BStr::release. A null BSTR is a valid empty string. On
// Windows (BStrWin32.cpp) these are the system's strings (SysAllocStringLen, SysFreeString).
using BSTR = WideChar*;

class BStr {
  public:
    // Copies a NUL-terminated text; null gives null.
    static BSTR allocate(const WideChar* text);
    // Copies `length` code units (NULs included); a null `text` gives that many zeros.
    static BSTR allocate(const WideChar* text, std::uint32_t length);
    // Accepts null.
    static void release(BSTR text) noexcept;
    // Code units, from the prefix: embedded NULs count; null has length 0.
    static std::uint32_t length(const WideChar* text) noexcept;
};

}  // namespace qv::dsc

#endif
