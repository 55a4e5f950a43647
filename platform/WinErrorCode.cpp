#include "platform/WinError.h"

namespace qv::dsc::osdep {

namespace {

struct tCodePair {
    std::uint32_t hostError;
    std::uint32_t code;
};

constexpr tCodePair kCodes[] = {
    {0, 0},
    {2, 7},
    {3, 7},
    {15, 7},
    {4, 11},
    {5, 0x80070005u},
    {6, 1},
    {87, 1},
    {8, 2},
    {14, 2},
    {11, 23},
    {16, 8},
    {19, 8},
    {32, 8},
    {33, 8},
    {20, 37},
    {23, static_cast<std::uint32_t>(-508)},
    {38, 4},
    {39, 9},
    {80, static_cast<std::uint32_t>(-98)},
};

}  // namespace

std::uint32_t WinError::codeOf(std::uint32_t hostError) noexcept {
    for (const tCodePair& pair : kCodes) {
        if (pair.hostError == hostError) {
            return pair.code;
        }
    }
    return OSException::kCode;
}

}  // namespace qv::dsc::osdep
