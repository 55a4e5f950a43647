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
    if (session_->isReady() && (!network || session_->initialize())) {
        return true;
    }
    output_.error("no-expert", session_->failure());
    failed = ExitCode::kNoExpert;
    return false;
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
                               : "cannot look up " + item + " (discovery failed)",
                           {{"item", item}});
    return {};
}

ExitCode CommandContext::reportFailure(HRESULT result, const std::string& what,
                                       nlohmann::json details) const {
    const ExitCode code = exitCodeOf(result);
    std::string message = what;
    if (code == ExitCode::kFailed) {
        message += " (" + hresultText(result) + ")";
    }
    details["result"] = hresultText(result);
    output_.error(errorKind(code), message, details);
    return code;
}

}  // namespace corbel
