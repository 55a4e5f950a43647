#include "corbel/ExitCode.h"

#include <cstdio>

namespace corbel {

ExitCode exitCodeOf(HRESULT result) {
    if (result == S_OK) {
        return ExitCode::kSuccess;
    }
    if (result == S_FALSE || result == CORBEL_E_ITEM_NOT_FOUND) {
        return ExitCode::kNothingFound;
    }
    if (result == CORBEL_E_INVALID_VALUE) {
        return ExitCode::kRejected;
    }
    return ExitCode::kFailed;
}

std::string hresultText(HRESULT result) {
    char text[16];
    std::snprintf(text, sizeof text, "0x%08X", static_cast<unsigned>(result));
    return text;
}

}  // namespace corbel
