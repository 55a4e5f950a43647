#ifndef QV_CORBEL_TEXTCASE_H
#define QV_CORBEL_TEXTCASE_H

#include <algorithm>
#include <string_view>

namespace corbel {

// ASCII letters compared without their case: tag names, item names and HTTP header names,
// none of which depends on a locale.
inline bool sameIgnoringCase(std::string_view left, std::string_view right) {
    const auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; };
    return std::ranges::equal(left, right, [&](char a, char b) { return lower(a) == lower(b); });
}

}  // namespace corbel

#endif
