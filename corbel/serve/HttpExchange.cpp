#include "corbel/serve/HttpExchange.h"

#include <algorithm>

#include "corbel/TextCase.h"

namespace corbel {

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
