#include "platform/SettingsStore.h"

#include <cstdlib>
#include <fstream>
#include <iterator>

namespace qv::dsc::osdep {

namespace {

constexpr std::size_t kMaxValueText = 64;

bool isSpecialSegment(std::string_view segment) {
    return segment.empty() || segment == "." || segment == "..";
}

std::optional<std::uint32_t> parseNumber(std::string_view text) {
    const std::size_t first = text.find_first_not_of(" \t\r\n");
    const std::size_t last = text.find_last_not_of(" \t\r\n");
    if (first == text.npos) {
        return std::nullopt;
    }
    text = text.substr(first, last - first + 1);
    int base = 10;
    if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {
        base = 16;
        text.remove_prefix(2);
    }
    std::uint64_t value = 0;
    for (const char c : text) {
        const int digit = c >= '0' && c <= '9'                 ? c - '0'
                          : base == 16 && c >= 'a' && c <= 'f' ? c - 'a' + 10
                          : base == 16 && c >= 'A' && c <= 'F' ? c - 'A' + 10
                                                               : -1;
        if (digit < 0) {
            return std::nullopt;
        }
        value = value * static_cast<std::uint64_t>(base) + static_cast<std::uint64_t>(digit);
        if (value > 0xFFFFFFFFu) {
            return std::nullopt;
        }
    }
    return static_cast<std::uint32_t>(value);
}

}  // namespace

SettingsStore::SettingsStore(std::string_view keyPath) {
    const char* root = std::getenv(kRootVariable);
    folder_ = root != nullptr && *root != '\0' ? root : kDefaultRoot;
    while (!keyPath.empty()) {
        const std::size_t end = keyPath.find_first_of("\\/");
        const std::string_view segment = keyPath.substr(0, end);
        if (!isSpecialSegment(segment)) {
            folder_ += '/';
            folder_ += segment;
        }
        keyPath.remove_prefix(end == keyPath.npos ? keyPath.size() : end + 1);
    }
}

std::optional<std::uint32_t> SettingsStore::readNumber(std::string_view valueName) const {
    if (isSpecialSegment(valueName) || valueName.find('/') != valueName.npos ||
        valueName.find('\0') != valueName.npos) {
        return std::nullopt;
    }
    std::ifstream file(folder_ + '/' + std::string(valueName));
    if (!file) {
        return std::nullopt;
    }
    std::string text(kMaxValueText + 1, '\0');
    file.read(text.data(), static_cast<std::streamsize>(text.size()));
    const auto count = static_cast<std::size_t>(file.gcount());
    if (count > kMaxValueText) {
        return std::nullopt;
    }
    text.resize(count);
    return parseNumber(text);
}

}  // namespace qv::dsc::osdep
