#include "platform/SettingsStore.h"

#include <charconv>
#include <cstdlib>
#include <fstream>
#include <iterator>

namespace qv::dsc::osdep {

namespace {

constexpr std::size_t kMaxNumberText = 64;
constexpr std::size_t kMaxValueText = 4096;

bool isSpecialSegment(std::string_view segment) {
    return segment.empty() || segment == "." || segment == "..";
}

// A decimal or 0x-prefixed hexadecimal number that fits 32 bits, blanks around it allowed.
std::optional<std::uint32_t> parseNumber(std::string_view text) {
    const std::size_t first = text.find_first_not_of(" \t\r\n");
    if (first == text.npos) {
        return std::nullopt;
    }
    text = text.substr(first, text.find_last_not_of(" \t\r\n") - first + 1);
    int base = 10;
    if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {
        base = 16;
        text.remove_prefix(2);
    }
    std::uint32_t value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, base);
    if (error != std::errc() || end != text.data() + text.size()) {
        return std::nullopt;
    }
    return value;
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
    const std::optional<std::string> text = readText(valueName);
    if (!text || text->size() > kMaxNumberText) {
        return std::nullopt;
    }
    return parseNumber(*text);
}

std::optional<std::string> SettingsStore::readText(std::string_view valueName) const {
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
    return text;
}

}  // namespace qv::dsc::osdep
