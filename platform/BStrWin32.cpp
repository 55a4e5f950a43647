#include <windows.h>
// After windows.h, which it needs.
#include <oleauto.h>

#include <new>
#include <type_traits>

#include "platform/BStr.h"
#include "platform/SafeInteger.h"

namespace qv::dsc {

// Windows backend: the system's own strings (oleaut32), which a host releases with
// SysFreeString and which the library releases the same way, whoever allocated them.
static_assert(std::is_same_v<BSTR, ::BSTR>);

BSTR BStr::allocateUnits(std::uint32_t length) {
    // The same range checks as everywhere: length prefix, text and NUL fit in 32 bits.
    std::uint32_t blockOctets = sizeof(std::uint32_t);
    SafeInteger::addAssign(blockOctets, SafeInteger::doubled(length));
    SafeInteger::addAssign(blockOctets, sizeof(OleChar));
    BSTR result = SysAllocStringLen(nullptr, length);
    if (result == nullptr) {
        throw std::bad_alloc();
    }
    return result;
}

void BStr::release(BSTR text) noexcept {
    SysFreeString(text);
}

std::uint32_t BStr::length(const OleChar* text) noexcept {
    return SysStringLen(const_cast<OleChar*>(text));
}

}  // namespace qv::dsc
