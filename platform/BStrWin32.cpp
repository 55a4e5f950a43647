#include <windows.h>
// After windows.h, which it needs.
#include <oleauto.h>

#include <new>

#include "platform/BStr.h"
#include "platform/NumericCast.h"
#include "platform/SafeInteger.h"

namespace qv::dsc {

// Windows backend: the system's own strings, which a host releases with SysFreeString.
// WideChar and the system's OLECHAR are both 16-bit UTF-16 code units of the same layout.
static_assert(sizeof(WideChar) == sizeof(OLECHAR));

namespace {

const OLECHAR* systemText(const WideChar* text) {
    return reinterpret_cast<const OLECHAR*>(text);
}

}  // namespace

BSTR BStr::allocate(const WideChar* text) {
    if (text == nullptr) {
        return nullptr;
    }
    std::size_t length = 0;
    while (text[length] != u'\0') {
        ++length;
    }
    return allocate(text, NumericCast::toU32(length));
}

BSTR BStr::allocate(const WideChar* text, std::uint32_t length) {
    // The same range checks as everywhere: length prefix, text and NUL fit in 32 bits.
    std::uint32_t blockOctets = sizeof(std::uint32_t);
    SafeInteger::addAssign(blockOctets, SafeInteger::doubled(length));
    SafeInteger::addAssign(blockOctets, sizeof(WideChar));
    ::BSTR result = SysAllocStringLen(systemText(text), length);
    if (result == nullptr) {
        throw std::bad_alloc();
    }
    return reinterpret_cast<BSTR>(result);
}

void BStr::release(BSTR text) noexcept {
    SysFreeString(reinterpret_cast<::BSTR>(text));
}

std::uint32_t BStr::length(const WideChar* text) noexcept {
    return SysStringLen(reinterpret_cast<::BSTR>(const_cast<WideChar*>(text)));
}

}  // namespace qv::dsc
