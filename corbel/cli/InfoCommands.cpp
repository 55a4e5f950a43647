#include "corbel/PropertyValue.h"
#include "corbel/TagCatalog.h"
#include "corbel/WideText.h"
#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"
#include "corbel/cli/Table.h"

// The commands that need no clock: info, version and tags.

namespace corbel {

namespace {

std::string identityText(IkxSysExpertInfo& expert, HRESULT (IkxSysExpertInfo::*get)(BSTR*)) {
    OwnedBstr text;
    return SUCCEEDED((expert.*get)(text.out())) ? text.utf8() : std::string("?");
}

}  // namespace

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
    const nlohmann::ordered_json info = {
        {"displayName", identityText(expert, &IkxSysExpertInfo::GetDisplayName)},
        {"version", identityText(expert, &IkxSysExpertInfo::GetVersionString)},
        {"shortName", identityText(expert, &IkxSysExpertInfo::GetShortName)},
        {"identifier", guid},
        {"library", context.libraryPath()}};
    if (context.out().json()) {
        context.out().printJson(info);
        return ExitCode::kSuccess;
    }
    Table table;
    const char* const labels[] = {"display name", "version", "short name", "identifier", "library"};
    std::size_t row = 0;
    for (const auto& [key, value] : info.items()) {
        table.add({labels[row++], value.get<std::string>()});
    }
    table.print();
    return ExitCode::kSuccess;
}

ExitCode runVersion(const Options& options) {
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    const bool loaded = context.open(false, failed);
    nlohmann::ordered_json versions = {{"corbel", QV_CORBEL_VERSION}, {"expert", nullptr}};
    if (loaded) {
        versions["expert"] = {
            {"version", identityText(context.expert(), &IkxSysExpertInfo::GetVersionString)},
            {"displayName", identityText(context.expert(), &IkxSysExpertInfo::GetDisplayName)},
            {"library", context.libraryPath()}};
    }
    if (context.out().json()) {
        context.out().printJson(versions);
        return failed;
    }
    Table table;
    table.add({"corbel", QV_CORBEL_VERSION});
    if (loaded) {
        const auto& expert = versions["expert"];
        table.add({"expert", expert["version"].get<std::string>() + "  (" +
                                 expert["displayName"].get<std::string>() + ", " +
                                 context.libraryPath() + ")"});
    }
    table.print();
    return failed;
}

ExitCode runTags(const Options& options) {
    nlohmann::ordered_json document = nlohmann::ordered_json::object();
    Table table;
    table.add({" ", "NAME", "TAG", "TYPE"});
    for (const TagInfo* info : tagsInOrder()) {
        document[info->name] = {{"tag", tagText(info->tag)},
                                {"type", typeName(info->type)},
                                {"settable", info->settable}};
        table.add(
            {info->settable ? "*" : " ", info->name, tagText(info->tag), typeName(info->type)});
    }
    if (options.json) {
        Output(true).printJson(document);
    } else {
        table.print();
        std::printf("(* settable with corbel set, in this order)\n");
    }
    return ExitCode::kSuccess;
}

}  // namespace corbel
