#include "corbel/CommandContext.h"

#include "corbel/WideText.h"

namespace corbel {

namespace {

const char* errorKind(ExitCode code) {
    switch (code) {
        case ExitCode::kNothingFound:
            return "not-found";
        case ExitCode::kRejected:
            return "rejected";
        default:
            return "refused";
    }
}

}  // namespace

CommandContext::CommandContext(const Options& options)
    : output_(options.json), wait_(options.waitMilliseconds), expertPath_(options.expertPath) {}

bool CommandContext::open(bool network, ExitCode& failed) {
    session_ = std::make_unique<ExpertSession>(expertPath_);
    if (!session_->isReady()) {
        output_.error("no-expert", session_->failure());
    } else if (network && !session_->initialize()) {
        const std::string reason = lastFailure();
        output_.error("no-expert", session_->failure() + (reason.empty() ? "" : ": " + reason));
    } else {
        return true;
    }
    failed = ExitCode::kNoExpert;
    return false;
}

std::string CommandContext::lastFailure() const {
    const auto failures = queryInterface<IkxQvLastFailure>(expert(), IID_IkxQvLastFailure);
    OwnedBstr description;
    if (!failures || failures->GetLastFailure(description.out(), nullptr) != S_OK) {
        return {};
    }
    return description.utf8();
}

ComPtr<IkxSysPropertyBag> CommandContext::getItem(const std::string& item, ExitCode& failed) const {
    ComPtr<IkxSysPropertyBag> bag;
    const HRESULT result = expert().GetItem(toUtf16(item).c_str(), bag.out());
    if (SUCCEEDED(result) && bag) {
        return bag;
    }
    failed = reportFailure(FAILED(result) ? result : E_POINTER,
                           result == CORBEL_E_ITEM_NOT_FOUND
                               ? "no clock answers to the item name " + item
                               : "cannot look up " + item,
                           {{"item", item}});
    return {};
}

ExitCode CommandContext::reportFailure(HRESULT result, const std::string& what,
                                       nlohmann::json details) const {
    const ExitCode code = exitCodeOf(result);
    std::string message = what;
    if (code == ExitCode::kFailed) {
        const std::string reason = lastFailure();
        message += (reason.empty() ? "" : ": " + reason) + " (" + hresultText(result) + ")";
        details["reason"] = reason;
    }
    details["result"] = hresultText(result);
    output_.error(errorKind(code), message, details);
    return code;
}

}  // namespace corbel
