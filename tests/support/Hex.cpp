#include "tests/support/Hex.h"

#include <stdexcept>

namespace qvtest {

namespace {

int nibble(char c) {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    if (c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    if (c >= 'A' && c <= 'F') {
        return c - 'A' + 10;
    }
    return -1;
}

}  // namespace

std::vector<std::uint8_t> hexOctets(std::string_view text) {
    std::vector<std::uint8_t> octets;
    int high = -1;
    for (char c : text) {
        if (c == ' ' || c == '\n' || c == '\t' || c == '|' || c == '\r') {
            continue;
        }
        const int value = nibble(c);
        if (value < 0) {
            throw std::invalid_argument("not a hex digit in test vector");
        }
        if (high < 0) {
            high = value;
        } else {
            octets.push_back(static_cast<std::uint8_t>(high * 16 + value));
            high = -1;
        }
    }
    if (high >= 0) {
        throw std::invalid_argument("odd number of hex digits in test vector");
    }
    return octets;
}

std::string hexText(const std::uint8_t* octets, std::size_t count) {
    static const char digits[] = "0123456789ABCDEF";
    std::string text;
    for (std::size_t i = 0; i < count; ++i) {
        if (i != 0) {
            text += ' ';
        }
        text += digits[octets[i] >> 4];
        text += digits[octets[i] & 0x0F];
    }
    return text;
}

std::string hexText(const std::vector<std::uint8_t>& octets) {
    return hexText(octets.data(), octets.size());
}

}  // namespace qvtest
