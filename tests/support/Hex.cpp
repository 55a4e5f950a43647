#include "tests/support/Hex.h"

#include <cctype>
#include <stdexcept>

namespace qvtest {

std::vector<std::uint8_t> hexOctets(std::string_view text) {
    std::string digits;
    for (char c : text) {
        if (std::isxdigit(static_cast<unsigned char>(c)) != 0) {
            digits += c;
        } else if (std::string_view(" \n\t\r|").find(c) == std::string_view::npos) {
            throw std::invalid_argument("not a hex digit in test vector");
        }
    }
    if (digits.size() % 2 != 0) {
        throw std::invalid_argument("odd number of hex digits in test vector");
    }
    std::vector<std::uint8_t> octets;
    for (std::size_t i = 0; i < digits.size(); i += 2) {
        octets.push_back(static_cast<std::uint8_t>(std::stoi(digits.substr(i, 2), nullptr, 16)));
    }
    return octets;
}

std::string hexText(const std::uint8_t* octets, std::size_t count) {
    static const char digits[] = "0123456789ABCDEF";
    std::string text;
    for (std::size_t i = 0; i < count; ++i) {
        text += i == 0 ? "" : " ";
        text += digits[octets[i] >> 4];
        text += digits[octets[i] & 0x0F];
    }
    return text;
}

}  // namespace qvtest
