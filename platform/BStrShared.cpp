#include <cstring>
#include <string>

#include "platform/BStr.h"
#include "platform/NumericCast.h"

// What is the same for both allocators: the copies.

namespace qv::dsc {

BSTR BStr::allocate(std::u16string_view text) {
    BSTR result = allocateUnits(NumericCast::toU32(text.size()));
    OleText::copy(text, result);
    return result;
}

BSTR BStr::copy(const OleChar* text) {
    if (text == nullptr) {
        return nullptr;
    }
    return copy(text, NumericCast::toU32(std::basic_string_view<OleChar>(text).size()));
}

BSTR BStr::copy(const OleChar* text, std::uint32_t length) {
    BSTR result = allocateUnits(length);
    if (length != 0) {
        std::memcpy(result, text, std::size_t{length} * sizeof(OleChar));
    }
    return result;
}

}  // namespace qv::dsc
