#include <cstdio>

#include "corbel/ComPtr.h"
#include "corbel/Commands.h"
#include "corbel/TagCatalog.h"
#include "corbel/WideText.h"

// corbel set ITEM NAME=VALUE...: the values go into the item's own bag as its changed tags,
// the expert validates them (its sentences name what it rejects) and then writes them.

namespace corbel {

namespace {

struct Change {
    const TagInfo* info;
    PropertyValue value;
};

// NAME=VALUE to a settable tag and a value of its type; reports what is wrong otherwise.
std::optional<Change> parseChange(const std::string& assignment, const Output& output) {
    const auto equals = assignment.find('=');
    if (equals == std::string::npos) {
        output.error("usage", "'" + assignment + "' is not NAME=VALUE");
        return std::nullopt;
    }
    const std::string name = assignment.substr(0, equals);
    const TagInfo* info = findTag(name);
    if (info == nullptr) {
        output.error("usage", "unknown tag '" + name + "' (corbel tags lists them)");
        return std::nullopt;
    }
    if (!info->settable) {
        output.error("usage", std::string(info->name) + " cannot be set");
        return std::nullopt;
    }
    auto value = parseValue(std::string_view(assignment).substr(equals + 1), info->type);
    if (!value) {
        output.error("usage", std::string(info->name) + " takes a value of type " +
                                  typeName(info->type) + ", not '" + assignment.substr(equals + 1) +
                                  "'");
        return std::nullopt;
    }
    return Change{info, std::move(*value)};
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

// The expert checks the changed tags of `bag`, then writes them to the clock.
ExitCode validateAndApply(const CommandContext& context, const std::string& item,
                          IkxSysPropertyBag2& bag) {
    const auto name = toUtf16(item);
    ComPtr<IkxSysEnumPropertyTag> accepted;
    OwnedBstr message;
    const HRESULT valid =
        context.expert().ValidateChanges(name.c_str(), &bag, accepted.out(), message.out());
    if (valid == CORBEL_E_INVALID_VALUE) {
        return context.reportFailure(valid, "rejected by validation:" + sentencesOf(message.utf8()),
                                     {{"item", item}, {"sentences", message.utf8()}});
    }
    if (FAILED(valid)) {
        return context.reportFailure(valid, "the changes cannot be validated");
    }
    ULONG ignored = 0;
    const HRESULT applied = context.expert().ApplyChanges(name.c_str(), &bag, &ignored);
    if (FAILED(applied)) {
        return context.reportFailure(applied, item + ": cannot write the changes",
                                     {{"item", item}});
    }
    return ExitCode::kSuccess;
}

}  // namespace

ExitCode runSet(const Options& options, const std::string& item,
                const std::vector<std::string>& assignments) {
    const Output output(options.json);
    std::vector<Change> changes;
    for (const std::string& assignment : assignments) {
        auto change = parseChange(assignment, output);
        if (!change) {
            return ExitCode::kBadUsage;
        }
        changes.push_back(std::move(*change));
    }
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(true, failed)) {
        return failed;
    }
    context.announce(("set " + item).c_str());
    const auto base = context.getItem(item, failed);
    if (!base) {
        return failed;
    }
    const auto bag = base.query<IkxSysPropertyBag2>(IID_IkxSysPropertyBag2);
    if (!bag || FAILED(bag->ClearChangedTags())) {
        return context.reportFailure(E_NOINTERFACE, "the item's bag takes no changes");
    }
    for (const Change& change : changes) {
        const HRESULT stored = storeValue(*bag.get(), change.info->tag, change.value);
        if (FAILED(stored)) {
            return context.reportFailure(stored, std::string("cannot store ") + change.info->name);
        }
    }
    const ExitCode written = validateAndApply(context, item, *bag);
    if (written != ExitCode::kSuccess) {
        return written;
    }
    for (const Change& change : changes) {
        std::printf("%s: %s = %s\n", item.c_str(), change.info->name, toText(change.value).c_str());
    }
    return ExitCode::kSuccess;
}

}  // namespace corbel
