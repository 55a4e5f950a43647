#ifndef QV_TESTS_SUPPORT_HEX_H
#define QV_TESTS_SUPPORT_HEX_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace qvtest {

// Octets from hex text; spaces, line ends and "|" separators (used to comment field
// boundaries in test vectors) are ignored.
std::vector<std::uint8_t> hexOctets(std::string_view text);

// Upper-case hex, one space between octets: "0B 02 00 36".
std::string hexText(const std::uint8_t* octets, std::size_t count);
inline std::string hexText(const std::vector<std::uint8_t>& octets) {
    return hexText(octets.data(), octets.size());
}

}  // namespace qvtest

#endif
