#include <algorithm>
#include <cstdio>

#include "corbel/ChangeOutcome.h"
#include "corbel/ComPtr.h"
#include "corbel/ItemName.h"
#include "corbel/TagCatalog.h"
#include "corbel/ValueJson.h"
#include "corbel/ValueWords.h"
#include "corbel/WideText.h"
#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"

// corbel set ITEM NAME=VALUE...: the values go into the item's own bag as its changed tags,
// the expert validates them (its sentences name what it rejects) and then writes them, one
// request per tag in ascending tag order, stopping at the first that fails.

namespace corbel {

namespace {

struct Change {
    const TagInfo* info;
    PropertyValue value;
};

// NAME=VALUE to a settable tag and a value of its type; the reason otherwise.
std::optional<Change> parseChange(const std::string& assignment, std::string& problem) {
    const auto equals = assignment.find('=');
    if (equals == std::string::npos) {
        problem = "'" + assignment + "' is not NAME=VALUE";
        return std::nullopt;
    }
    const std::string name = assignment.substr(0, equals);
    const std::string text = assignment.substr(equals + 1);
    const TagInfo* info = findTag(name);
    if (info == nullptr) {
        problem = "unknown tag '" + name + "' (corbel tags lists them)";
    } else if (!info->settable) {
        problem = std::string(info->name) + " cannot be set (corbel tags marks the ones that can)";
    } else if (ParsedValue parsed = parseValue(text, info->type); !parsed.value) {
        problem = std::string(info->name) + " " + parsed.expected + ", not '" + text + "'";
    } else {
        return Change{info, std::move(*parsed.value)};
    }
    return std::nullopt;
}

// The changes of the command line, or a usage error reported.
std::optional<std::vector<Change>> parseChanges(const std::vector<std::string>& assignments,
                                                const Output& output) {
    std::vector<Change> changes;
    std::string problem;
    for (const std::string& assignment : assignments) {
        auto change = parseChange(assignment, problem);
        if (change && std::ranges::any_of(changes, [&](const Change& earlier) {
                return earlier.info == change->info;
            })) {
            problem = std::string(change->info->name) + " is given twice";
            change.reset();
        }
        if (!change) {
            output.error("usage", problem);
            return std::nullopt;
        }
        changes.push_back(std::move(*change));
    }
    std::ranges::sort(changes, {}, [](const Change& change) { return change.info->tag; });
    return changes;
}

// The expert's sentences end with two spaces each; here each stands on a line of its own.
std::string sentencesOf(const std::string& message) {
    std::string lines;
    std::size_t start = 0;
    for (std::size_t end = 0; (end = message.find(".  ", start)) != std::string::npos;
         start = end + 3) {
        lines += "\n  " + message.substr(start, end + 1 - start);
    }
    return start < message.size() ? lines + "\n  " + message.substr(start) : lines;
}

std::string namesText(const std::vector<kxSysAttributeTagID>& tags) {
    std::string text;
    for (const kxSysAttributeTagID tag : tags) {
        text += (text.empty() ? "" : ", ") + tagName(tag);
    }
    return text.empty() ? "nothing" : text;
}

// Says what became of each change after ApplyChanges failed.
ExitCode reportOutcome(const CommandContext& context, const std::string& item,
                       const ChangeOutcome& outcome, const FailureCause& cause) {
    std::string what = item + ": ";
    if (outcome.failed) {
        what +=
            (cause.kind == kxQvFailureKind::refusedByClock ? "the clock refused " : "cannot set ") +
            tagName(*outcome.failed);
    } else {
        what += "the changes failed";
    }
    const ExitCode code = context.report(what, cause, changeJson(item, outcome, cause));
    if (!context.out().json()) {
        if (outcome.failed) {
            std::fprintf(stderr, "  written: %s\n  not sent: %s\n",
                         namesText(outcome.written).c_str(), namesText(outcome.notSent).c_str());
        } else {
            std::fprintf(stderr, "  any of these may have been written: %s\n",
                         namesText(outcome.unknown).c_str());
        }
    }
    return code;
}

// The expert checks the changed tags of `bag`, then writes them to the clock.
ExitCode validateAndApply(const CommandContext& context, const std::string& item,
                          IkxSysPropertyBag2& bag, const std::vector<Change>& changes) {
    const auto name = toUtf16(item);
    ComPtr<IkxSysEnumPropertyTag> accepted;
    OwnedBstr message;
    const HRESULT valid =
        context.expert().ValidateChanges(name.c_str(), &bag, accepted.out(), message.out());
    if (valid == CORBEL_E_INVALID_VALUE) {
        context.out().error("rejected", "rejected by validation:" + sentencesOf(message.utf8()),
                            {{"item", item}, {"sentences", message.utf8()}});
        return ExitCode::kRejected;
    }
    if (FAILED(valid)) {
        return context.report(item + ": the changes cannot be validated",
                              FailureCause::last(context.expert(), valid));
    }
    ULONG ignored = 0;
    const HRESULT applied = context.expert().ApplyChanges(name.c_str(), &bag, &ignored);
    const FailureCause cause =
        FAILED(applied) ? FailureCause::last(context.expert(), applied) : FailureCause{};
    std::vector<kxSysAttributeTagID> tags;
    for (const Change& change : changes) {
        tags.push_back(change.info->tag);
    }
    const ChangeOutcome outcome = ChangeOutcome::of(tags, cause);
    if (context.out().json()) {
        context.out().printJson(changeJson(item, outcome, cause));
    }
    if (FAILED(applied)) {
        return reportOutcome(context, item, outcome, cause);
    }
    if (!context.out().json()) {
        for (const Change& change : changes) {
            std::printf("%s: %s = %s\n", item.c_str(), change.info->name,
                        valueText(change.info->tag, change.value).c_str());
        }
    }
    return ExitCode::kSuccess;
}

}  // namespace

ExitCode runSet(const Options& options, const std::vector<std::string>& arguments) {
    const Output output(options.json);
    if (!isItemName(arguments.front())) {
        output.error("usage", "'" + arguments.front() + "' is not an item name (such as " +
                                  kItemNameExample + "; corbel list shows them)");
        return ExitCode::kBadUsage;
    }
    if (arguments.size() < 2) {
        output.error("usage", "set needs NAME=VALUE after the item name");
        return ExitCode::kBadUsage;
    }
    const std::string& item = arguments.front();
    const auto changes = parseChanges({arguments.begin() + 1, arguments.end()}, output);
    if (!changes) {
        return ExitCode::kBadUsage;
    }
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(true, failed)) {
        return failed;
    }
    ComPtr<IkxSysPropertyBag> base;
    const HRESULT found = context.expert().GetItem(toUtf16(item).c_str(), base.out());
    if (FAILED(found) || !base) {
        return context.reportReading(
            {item, FailureCause::last(context.expert(), FAILED(found) ? found : E_POINTER), {}, {}},
            false);
    }
    const auto bag = base.query<IkxSysPropertyBag2>(IID_IkxSysPropertyBag2);
    if (!bag || FAILED(bag->ClearChangedTags())) {
        return context.report(item + ": the item's bag takes no changes",
                              FailureCause::of(E_NOINTERFACE));
    }
    for (const Change& change : *changes) {
        const HRESULT stored = storeValue(*bag.get(), change.info->tag, change.value);
        if (FAILED(stored)) {
            return context.report(std::string("cannot store ") + change.info->name,
                                  FailureCause::of(stored));
        }
    }
    return validateAndApply(context, item, *bag, *changes);
}

}  // namespace corbel
