#include "corbel/ExitCode.h"

#include <cstdio>

namespace corbel {

ExitCode exitCodeOf(HRESULT result, kxQvFailureKind kind) {
    switch (result) {
        case S_OK:
            return ExitCode::kSuccess;
        case S_FALSE:
            return kind == kxQvFailureKind::none || kind == kxQvFailureKind::noAnswer
                       ? ExitCode::kNothingFound
                       : ExitCode::kFailed;
        case CORBEL_E_ITEM_NOT_FOUND:
            return ExitCode::kNothingFound;
        case CORBEL_E_TAG_NOT_FOUND:
            return ExitCode::kBadUsage;
        case CORBEL_E_INVALID_VALUE:
            return ExitCode::kRejected;
        case E_NOT_VALID_STATE:
            return ExitCode::kNoExpert;
        default:
            return kind == kxQvFailureKind::invalidValue ? ExitCode::kRejected : ExitCode::kFailed;
    }
}

ExitCode worse(ExitCode left, ExitCode right) {
    const auto rank = [](ExitCode code) {
        switch (code) {
            case ExitCode::kSuccess:
                return 0;
            case ExitCode::kNothingFound:
                return 1;
            default:
                return 2 + static_cast<int>(code);
        }
    };
    return rank(left) >= rank(right) ? left : right;
}

std::string hresultText(HRESULT result) {
    char text[16];
    std::snprintf(text, sizeof text, "0x%08X", static_cast<unsigned>(result));
    return text;
}

}  // namespace corbel
