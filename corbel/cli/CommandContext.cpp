#include "corbel/cli/CommandContext.h"

#include <algorithm>

#include "corbel/Discovery.h"
#include "corbel/ProcessEnvironment.h"
#include "corbel/TagCatalog.h"
#include "platform/DiscoveryInterfaces.h"
#include "platform/MulticastInterfaces.h"

namespace corbel {

namespace {

using qv::dsc::osdep::DiscoveryInterfaces;
using qv::dsc::osdep::MulticastInterfaces;

std::string joined(const std::vector<std::string>& words, const char* separator) {
    std::string text;
    for (const std::string& word : words) {
        text += (text.empty() ? "" : separator) + word;
    }
    return text;
}

// The names of the interfaces that discovery may use.
std::vector<std::string> usableInterfaces() {
    std::vector<std::string> names;
    for (const auto& usable : MulticastInterfaces::list()) {
        names.push_back(usable.name);
    }
    return names;
}

}  // namespace

CommandContext::CommandContext(const Options& options)
    : options_(options), output_(options.json), wait_(options.waitMilliseconds) {}

const char* CommandContext::errorKind(ExitCode code) {
    switch (code) {
        case ExitCode::kNothingFound:
            return "not-found";
        case ExitCode::kBadUsage:
            return "usage";
        case ExitCode::kRejected:
            return "rejected";
        case ExitCode::kNoExpert:
            return "no-expert";
        default:
            return "failed";
    }
}

// The expert takes the same setting and refuses a name that it does not find; checked here
// first, so that a typing error is bad usage that lists the names there are.
bool CommandContext::chooseInterfaces(ExitCode& failed) const {
    const std::vector<std::string>& chosen = options_.interfaces;
    if (chosen.empty()) {
        return true;
    }
    const std::string setting = std::ranges::find(chosen, DiscoveryInterfaces::kAll) != chosen.end()
                                    ? std::string(DiscoveryInterfaces::kAll)
                                    : joined(chosen, ",");
    std::string unknown;
    if (setting != DiscoveryInterfaces::kAll &&
        DiscoveryInterfaces::choose(setting, MulticastInterfaces::list(), unknown).empty()) {
        const auto usable = usableInterfaces();
        output_.error("usage", "--interface " + unknown +
                                   ": no such interface that is up with IPv4 and multicast "
                                   "(there are: " +
                                   (usable.empty() ? "none" : joined(usable, ", ")) + ")");
        failed = ExitCode::kBadUsage;
        return false;
    }
    ProcessEnvironment::set(DiscoveryInterfaces::kVariable, setting);
    return true;
}

bool CommandContext::open(bool network, ExitCode& failed) {
    if (network && !chooseInterfaces(failed)) {
        return false;
    }
    if (options_.verbose) {
        ProcessEnvironment::set("QV_TRACE", "stderr");
    }
    session_ = std::make_unique<ExpertSession>(options_.expertPath);
    if (!session_->isReady()) {
        output_.error("no-expert", session_->failure());
    } else if (network && !session_->initialize()) {
        const FailureCause cause = FailureCause::last(expert(), E_FAIL);
        // The expert names the call that failed; only a refused bind is about privileges.
        const bool bind = cause.description.find("bind to UDP port") != std::string::npos;
        output_.error(
            "no-expert",
            session_->failure() + (cause.description.empty() ? "" : ": " + cause.description) +
                (bind ? " (UDP ports 319 and 320 need root or CAP_NET_BIND_SERVICE)" : ""));
    } else {
        return true;
    }
    failed = ExitCode::kNoExpert;
    return false;
}

ExitCode CommandContext::report(const std::string& what, const FailureCause& cause,
                                nlohmann::ordered_json details) const {
    const ExitCode code = exitCodeOf(cause.result, cause.kind);
    std::string message = what + ": " + cause.words();
    if (const std::string reason = cause.reason(); !reason.empty()) {
        message += " (" + reason + ")";
        details["reason"] = reason;
    }
    if (options_.verbose) {
        message += " [" + cause.internals() + "]";
        details["internal"] = cause.internals();
    }
    output_.error(errorKind(code), message, details);
    return code;
}

ExitCode CommandContext::reportReading(const ItemReading& reading, bool tagsNamed) const {
    if (reading.lookupFailure && reading.lookupFailure->result == CORBEL_E_ITEM_NOT_FOUND) {
        output_.error("not-found",
                      "no clock answers to the item name " + reading.item +
                          " (corbel list shows the clocks that answer)",
                      {{"item", reading.item}});
        return ExitCode::kNothingFound;
    }
    if (reading.lookupFailure) {
        return report(reading.item + ": cannot look it up", *reading.lookupFailure,
                      {{"item", reading.item}});
    }
    const ExitCode outcome = reading.outcome(tagsNamed);
    if (outcome == ExitCode::kSuccess) {
        return outcome;
    }
    // One line per reason, naming the tags it kept from being read.
    std::vector<std::pair<const FailureCause*, std::vector<std::string>>> reasons;
    for (const auto& [tag, cause] : reading.unread) {
        const auto same = std::ranges::find_if(
            reasons, [&](const auto& entry) { return entry.first->words() == cause.words(); });
        (same != reasons.end() ? same->second
                               : reasons.emplace_back(&cause, std::vector<std::string>{}).second)
            .push_back(tagName(tag));
    }
    for (const auto& [cause, names] : reasons) {
        report(reading.item + ": cannot read " + joined(names, ", "), *cause,
               {{"item", reading.item}});
    }
    return outcome;
}

ExitCode CommandContext::reportNothingFound(const FailureCause& cause) const {
    if (cause.kind != kxQvFailureKind::none) {
        return report("discovery failed", cause);
    }
    std::string message = "no PTP clock answered in domains 0 to 3";
    const auto interfaces = usableInterfaces();
    if (options_.interfaces.empty() && interfaces.size() > 1) {
        message += "; this machine has " + std::to_string(interfaces.size()) +
                   " multicast interfaces (" + joined(interfaces, ", ") +
                   "): choose with --interface NAME, or --interface all";
    }
    output_.error("not-found", message);
    return ExitCode::kNothingFound;
}

std::vector<ClockPort> CommandContext::discover(const std::string& purpose,
                                                ExitCode& failed) const {
    announce(purpose);
    const Discovery discovery = Discovery::run(expert());
    if (discovery.items.empty()) {
        failed = reportNothingFound(discovery.failure);
        return {};
    }
    std::vector<ClockPort> ports;
    for (const std::string& item : discovery.items) {
        const ItemReading reading = reader().read(item, {kxQvDomainNumber});
        const auto found = reading.values.find(kxQvDomainNumber);
        const auto* domain =
            found == reading.values.end() ? nullptr : std::get_if<std::uint32_t>(&found->second);
        if (domain == nullptr) {
            const auto unread = reading.unread.find(kxQvDomainNumber);
            failed = worse(failed,
                           report(item + ": cannot read its domain",
                                  unread != reading.unread.end()
                                      ? unread->second
                                      : reading.lookupFailure.value_or(FailureCause::of(E_FAIL))));
        }
        if (!options_.domain || (domain != nullptr && *domain == *options_.domain)) {
            ports.push_back({item, domain != nullptr ? std::optional(*domain) : std::nullopt});
        }
    }
    if (ports.empty()) {
        output_.error("not-found",
                      "no PTP clock answered in domain " + std::to_string(*options_.domain));
        failed = worse(failed, ExitCode::kNothingFound);
    }
    return ports;
}

}  // namespace corbel
