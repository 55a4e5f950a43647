#include "corbel/serve/HttpExchange.h"

#include <algorithm>

namespace corbel {

namespace {

bool sameIgnoringCase(std::string_view left, std::string_view right) {
    return std::ranges::equal(left, right, [](char a, char b) {
        return (a >= 'A' && a <= 'Z' ? a + 32 : a) == (b >= 'A' && b <= 'Z' ? b + 32 : b);
    });
}

}  // namespace

std::string HttpRequest::header(std::string_view name) const {
    for (const auto& [key, value] : headers) {
        if (sameIgnoringCase(key, name)) {
            return value;
        }
    }
    return {};
}

bool HttpRequest::hasHeader(std::string_view name) const {
    return std::ranges::any_of(
        headers, [name](const auto& entry) { return sameIgnoringCase(entry.first, name); });
}

}  // namespace corbel
