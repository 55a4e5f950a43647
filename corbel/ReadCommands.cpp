#include <cstdio>

#include "corbel/ComPtr.h"
#include "corbel/Commands.h"
#include "corbel/ItemCollector.h"
#include "corbel/TagCatalog.h"
#include "corbel/WideText.h"

// The commands that only read: info, list and items.

namespace corbel {

namespace {

const char* const kNothingFound = "no PTP clock answered in domains 0 to 3";

std::string identityText(IkxSysExpertInfo& expert, HRESULT (IkxSysExpertInfo::*get)(BSTR*)) {
    OwnedBstr text;
    return SUCCEEDED((expert.*get)(text.out())) ? text.utf8() : std::string("?");
}

std::vector<std::string> namesOf(IkxSysEnumStringList& names) {
    std::vector<std::string> result;
    BSTR batch[16] = {};
    ULONG fetched = 0;
    while (SUCCEEDED(names.Next(16, batch, &fetched)) && fetched > 0) {
        for (ULONG i = 0; i < fetched; ++i) {
            result.push_back(toUtf8(batch[i] == nullptr ? OLESTR("") : batch[i]));
            SysFreeString(batch[i]);
        }
        fetched = 0;
    }
    return result;
}

std::string textOf(const PropertyValues& values, kxSysAttributeTagID tag) {
    const auto found = values.find(tag);
    if (found == values.end()) {
        return "-";
    }
    const auto* text = std::get_if<std::string>(&found->second);
    return text != nullptr ? *text : toText(found->second);
}

nlohmann::json tagJson(kxSysAttributeTagID tag, const PropertyValue& value) {
    const TagInfo* info = findTag(tag);
    return {{"name", info != nullptr ? info->name : tagText(tag)},
            {"type", typeName(static_cast<ULONG>(value.index() + 1))},
            {"settable", info != nullptr && info->settable},
            {"value", toJson(value)}};
}

}  // namespace

nlohmann::json itemJson(const PropertyValues& values) {
    nlohmann::json item = nlohmann::json::object();
    for (const auto& [tag, value] : values) {
        item[tagText(tag)] = tagJson(tag, value);
    }
    return item;
}

ExitCode runInfo(const Options& options) {
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(false, failed)) {
        return failed;
    }
    IkxSysExpert2& expert = context.expert();
    GUID identifier{};
    const std::string guid =
        SUCCEEDED(expert.GetExpertGUID(&identifier)) ? guidText(identifier) : std::string("?");
    const std::string display = identityText(expert, &IkxSysExpertInfo::GetDisplayName);
    const std::string version = identityText(expert, &IkxSysExpertInfo::GetVersionString);
    const std::string shortName = identityText(expert, &IkxSysExpertInfo::GetShortName);
    if (context.out().json()) {
        context.out().printJson({{"displayName", display},
                                 {"version", version},
                                 {"shortName", shortName},
                                 {"identifier", guid},
                                 {"library", context.libraryPath()}});
    } else {
        Table table;
        table.add({"display name", display});
        table.add({"version", version});
        table.add({"short name", shortName});
        table.add({"identifier", guid});
        table.add({"library", context.libraryPath()});
        table.print();
    }
    return ExitCode::kSuccess;
}

ExitCode runList(const Options& options) {
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(true, failed)) {
        return failed;
    }
    context.announce("list");
    ComPtr<IkxSysEnumStringList> enumerator;
    const HRESULT result = context.expert().GetItemNames(enumerator.out());
    if (result != S_OK || !enumerator) {
        return context.reportFailure(result == S_OK ? S_FALSE : result, kNothingFound);
    }
    const auto names = namesOf(*enumerator);
    if (context.out().json()) {
        context.out().printJson(names);
    } else {
        for (const std::string& name : names) {
            std::printf("%s\n", name.c_str());
        }
    }
    return ExitCode::kSuccess;
}

ExitCode runItems(const Options& options) {
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(true, failed)) {
        return failed;
    }
    context.announce("items");
    ItemCollector collector;
    const HRESULT result = context.expert().EnumerateItems(&collector);
    if (result != S_OK || collector.items().empty()) {
        return context.reportFailure(result == S_OK ? S_FALSE : result, kNothingFound);
    }
    if (context.out().json()) {
        nlohmann::json document = nlohmann::json::object();
        for (const PropertyValues& item : collector.items()) {
            document[textOf(item, kxSysItemName)] = itemJson(item);
        }
        context.out().printJson(document);
        return ExitCode::kSuccess;
    }
    Table table;
    table.add(
        {"ITEM", "PROTOCOL ADDRESS", "PHYSICAL ADDRESS", "PRODUCT", "USER DESCRIPTION", "PROFILE"});
    for (const PropertyValues& item : collector.items()) {
        table.add({textOf(item, kxSysItemName), textOf(item, kxSysNetworkAddress),
                   textOf(item, kxSysHardwareAddress), textOf(item, kxQvProductDescription),
                   textOf(item, kxQvUserDescription), textOf(item, kxQvProfileIdentity)});
    }
    table.print();
    return ExitCode::kSuccess;
}

}  // namespace corbel
