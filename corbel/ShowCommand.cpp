#include <algorithm>
#include <cstdio>
#include <map>

#include "corbel/ComPtr.h"
#include "corbel/Commands.h"
#include "corbel/ReadGroups.h"
#include "corbel/TagCatalog.h"
#include "corbel/WideText.h"

// corbel show ITEM [TAG...]: the item's base bag, then one read per group of tags, so that
// a group the clock refuses is known by name and the others still show.

namespace corbel {

namespace {

struct Refusal {
    const ReadGroup* group;
    std::vector<kxSysAttributeTagID> tags;
};

// The tags to read from one group: all of it when no tag was asked for.
std::vector<kxSysAttributeTagID> tagsToRead(const ReadGroup& group,
                                            const std::vector<kxSysAttributeTagID>& wanted) {
    std::vector<kxSysAttributeTagID> tags;
    for (const kxSysAttributeTagID tag : group.tags) {
        if (wanted.empty() || std::ranges::find(wanted, tag) != wanted.end()) {
            tags.push_back(tag);
        }
    }
    return tags;
}

// One row per tag in tag order; the tags of a refused group say so.
void printTable(const std::string& item, const PropertyValues& values,
                const std::vector<Refusal>& refusals) {
    std::map<kxSysAttributeTagID, std::pair<ULONG, std::string>> rows;
    for (const auto& [tag, value] : values) {
        rows[tag] = {static_cast<ULONG>(value.index() + 1), toText(value)};
    }
    for (const Refusal& refusal : refusals) {
        for (const kxSysAttributeTagID tag : refusal.tags) {
            const TagInfo* info = findTag(tag);
            rows[tag] = {info != nullptr ? static_cast<ULONG>(info->type) : ULONG{0}, "(refused)"};
        }
    }
    Table table;
    table.add({" ", "NAME", "TAG", "TYPE", "VALUE"});
    for (const auto& [tag, row] : rows) {
        const TagInfo* info = findTag(tag);
        table.add({info != nullptr && info->settable ? "*" : " ",
                   info != nullptr ? info->name : "?", tagText(tag), typeName(row.first),
                   row.second});
    }
    std::printf("%s\n", item.c_str());
    table.print("  ");
    std::printf("  (* settable with corbel set)\n");
}

// Reads the groups of `wanted` (every group when it is empty) into `values`, one request
// each; the groups that fail are returned.
std::vector<Refusal> readFromClock(const CommandContext& context, const std::string& item,
                                   const std::vector<kxSysAttributeTagID>& wanted,
                                   PropertyValues& values) {
    const auto name = toUtf16(item);
    std::vector<Refusal> refusals;
    for (const ReadGroup& group : readGroups()) {
        const auto tags = tagsToRead(group, wanted);
        if (tags.empty()) {
            continue;
        }
        ComPtr<IkxSysPropertyBag> bag;
        const HRESULT result = context.expert().GetItemProperties(
            name.c_str(), static_cast<ULONG>(tags.size()), tags.data(), nullptr, bag.out());
        if (FAILED(result)) {  // reported before the bag is read: the reason is per call
            context.reportFailure(result, item + ": cannot read the " + group.name,
                                  {{"item", item}, {"group", group.name}});
            refusals.push_back({&group, tags});
        }
        if (bag) {
            for (auto& [tag, value] : readBag(*bag)) {
                values.insert_or_assign(tag, std::move(value));
            }
        }
    }
    return refusals;
}

}  // namespace

ExitCode runShow(const Options& options, const std::string& item,
                 const std::vector<std::string>& tagNames) {
    const Output output(options.json);
    std::vector<kxSysAttributeTagID> wanted;
    for (const std::string& name : tagNames) {
        const TagInfo* info = findTag(name);
        if (info == nullptr) {
            output.error("usage", "unknown tag '" + name + "' (corbel tags lists them)");
            return ExitCode::kBadUsage;
        }
        wanted.push_back(info->tag);
    }
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(true, failed)) {
        return failed;
    }
    context.announce(("show " + item).c_str());
    const auto base = context.getItem(item, failed);
    if (!base) {
        return failed;
    }
    PropertyValues values = readBag(*base);
    const auto refusals = readFromClock(context, item, wanted, values);
    if (!wanted.empty()) {
        std::erase_if(values, [&wanted](const auto& entry) {
            return std::ranges::find(wanted, entry.first) == wanted.end();
        });
    }
    if (context.out().json()) {
        context.out().printJson({{item, itemJson(values)}});
    } else {
        printTable(item, values, refusals);
    }
    return refusals.empty() ? ExitCode::kSuccess : ExitCode::kFailed;
}

}  // namespace corbel
