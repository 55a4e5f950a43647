#include "corbel/ItemName.h"

#include <cctype>

namespace corbel {

bool isItemName(std::string_view text) {
    const auto hex = [](char c) { return std::isxdigit(static_cast<unsigned char>(c)) != 0; };
    // "XX-" seven times, "XX:", then the decimal port number.
    for (std::size_t octet = 0; octet < 8; ++octet) {
        const char separator = octet < 7 ? '-' : ':';
        if (text.size() < 3 || !hex(text[0]) || !hex(text[1]) || text[2] != separator) {
            return false;
        }
        text.remove_prefix(3);
    }
    if (text.empty() || text.size() > 5) {
        return false;
    }
    for (const char digit : text) {
        if (digit < '0' || digit > '9') {
            return false;
        }
    }
    return true;
}

}  // namespace corbel
