#include "platform/BStr.h"

#include <cstring>
#include <new>

#include "platform/NumericCast.h"
#include "platform/SafeInteger.h"
#include "platform/TaskMemory.h"

namespace qv::dsc {

namespace {

constexpr std::uint32_t kPrefixSize = sizeof(std::uint32_t);

std::uint8_t* blockOf(const WideChar* text) {
    return const_cast<std::uint8_t*>(reinterpret_cast<const std::uint8_t*>(text)) - kPrefixSize;
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
    // Prefix, text and the NUL in octets, each step range-checked.
    const std::uint32_t textOctets = SafeInteger::doubled(length);
    std::uint32_t blockOctets = kPrefixSize;
    SafeInteger::addAssign(blockOctets, textOctets);
    SafeInteger::addAssign(blockOctets, sizeof(WideChar));
    auto* block = static_cast<std::uint8_t*>(TaskMemory::allocate(blockOctets));
    std::memcpy(block, &textOctets, kPrefixSize);
    auto* result = reinterpret_cast<WideChar*>(block + kPrefixSize);
    if (text != nullptr) {
        std::memcpy(result, text, textOctets);
    } else {
        std::memset(result, 0, textOctets);
    }
    result[length] = u'\0';
    return result;
}

void BStr::release(BSTR text) noexcept {
    if (text != nullptr) {
        TaskMemory::release(blockOf(text));
    }
}

std::uint32_t BStr::length(const WideChar* text) noexcept {
    if (text == nullptr) {
        return 0;
    }
    std::uint32_t octets = 0;
    std::memcpy(&octets, blockOf(text), kPrefixSize);
    return octets / static_cast<std::uint32_t>(sizeof(WideChar));
}

}  // namespace qv::dsc
