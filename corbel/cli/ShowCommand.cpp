#include <cstdio>

#include "corbel/ItemName.h"
#include "corbel/TagCatalog.h"
#include "corbel/ValueJson.h"
#include "corbel/ValueWords.h"
#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"
#include "corbel/cli/Table.h"

// corbel show ITEM... [TAG...]: each item's settings, read one group of tags at a time, so
// that a group the clock does not support shows as such and the rest still shows.

namespace corbel {

namespace {

// One row per tag, by dataset; a tag the clock did not give says why.
void printItem(const ItemReading& reading) {
    Table table;
    table.add({" ", "NAME", "VALUE"});
    for (const kxSysAttributeTagID tag : reading.tagsInOrder()) {
        const TagInfo* info = findTag(tag);
        const auto value = reading.values.find(tag);
        table.add({info != nullptr && info->settable ? "*" : " ", tagName(tag),
                   value != reading.values.end() ? valueText(tag, value->second)
                                                 : "(" + reading.unread.at(tag).words() + ")"});
    }
    std::printf("%s\n", reading.item.c_str());
    table.print("  ");
    std::printf("  (* settable with corbel set)\n");
}

}  // namespace

ExitCode runShow(const Options& options, const std::vector<std::string>& arguments) {
    const Output output(options.json);
    std::vector<std::string> items;
    std::vector<kxSysAttributeTagID> wanted;
    for (const std::string& word : arguments) {
        if (isItemName(word)) {
            items.push_back(word);
        } else if (const TagInfo* info = findTag(word)) {
            wanted.push_back(info->tag);
        } else {
            output.error("usage", "'" + word + "' is neither an item name (such as " +
                                      kItemNameExample + ") nor a tag (corbel tags lists them)");
            return ExitCode::kBadUsage;
        }
    }
    if (items.empty()) {
        output.error("usage", "show needs an item name before the tags (corbel list shows them)");
        return ExitCode::kBadUsage;
    }
    CommandContext context(options);
    ExitCode code = ExitCode::kSuccess;
    if (!context.open(true, code)) {
        return code;
    }
    nlohmann::ordered_json document = nlohmann::ordered_json::object();
    for (const std::string& item : items) {
        const ItemReading reading = context.reader().read(item, wanted, options.all);
        if (!reading.lookupFailure && options.json) {
            document[item] = itemJson(reading);
        } else if (!reading.lookupFailure) {
            std::printf("%s", &item == &items.front() ? "" : "\n");
            printItem(reading);
        }
        code = worse(code, context.reportReading(reading, !wanted.empty()));
    }
    if (options.json) {
        context.out().printJson(document);
    }
    return code;
}

}  // namespace corbel
