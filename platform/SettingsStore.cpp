#include "platform/SettingsStore.h"

#include <fstream>
#include <string>

#include "platform/EnvironmentVariable.h"

namespace qv::dsc::osdep {

namespace {

constexpr std::size_t kMaxNumberText = 64;
constexpr std::size_t kMaxValueText = 4096;

bool isSpecialSegment(std::string_view segment) {
    return segment.empty() || segment == "." || segment == "..";
}

}  // namespace

SettingsStore::SettingsStore(std::string_view keyPath)
    : location_(EnvironmentVariable::read(kRootVariable).value_or(kDefaultRoot)) {
    while (!keyPath.empty()) {
        const std::size_t end = keyPath.find_first_of("\\/");
        const std::string_view segment = keyPath.substr(0, end);
        if (!isSpecialSegment(segment)) {
            location_ += '/';
            location_ += segment;
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
    std::ifstream file(location_ + '/' + std::string(valueName));
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
