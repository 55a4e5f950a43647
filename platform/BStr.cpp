#include "platform/BStr.h"

#include <cstring>

#include "platform/SafeInteger.h"
#include "platform/TaskMemory.h"

namespace qv::dsc {

// POSIX backend: blocks of the C library's allocator (TaskMemory), which the public
// header's SysFreeString releases.

namespace {

constexpr std::uint32_t kPrefixSize = sizeof(std::uint32_t);

std::uint8_t* blockOf(const OleChar* text) {
    return const_cast<std::uint8_t*>(reinterpret_cast<const std::uint8_t*>(text)) - kPrefixSize;
}

}  // namespace

BSTR BStr::allocateUnits(std::uint32_t length) {
    // Prefix, text and the NUL in octets, each step range-checked.
    const std::uint32_t textOctets = SafeInteger::doubled(length);
    std::uint32_t blockOctets = kPrefixSize;
    SafeInteger::addAssign(blockOctets, textOctets);
    SafeInteger::addAssign(blockOctets, sizeof(OleChar));
    auto* block = static_cast<std::uint8_t*>(TaskMemory::allocate(blockOctets));
    std::memcpy(block, &textOctets, kPrefixSize);
    auto* result = reinterpret_cast<OleChar*>(block + kPrefixSize);
    result[length] = u'\0';
    return result;
}

void BStr::release(BSTR text) noexcept {
    if (text != nullptr) {
        TaskMemory::release(blockOf(text));
    }
}

std::uint32_t BStr::length(const OleChar* text) noexcept {
    if (text == nullptr) {
        return 0;
    }
    std::uint32_t octets = 0;
    std::memcpy(&octets, blockOf(text), kPrefixSize);
    return octets / static_cast<std::uint32_t>(sizeof(OleChar));
}

}  // namespace qv::dsc
