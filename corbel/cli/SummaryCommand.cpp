#include "corbel/ValueJson.h"
#include "corbel/ValueWords.h"
#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"
#include "corbel/cli/Table.h"

// corbel show (no item): every clock port in one table, a row each, with what tells how the
// network synchronises: domain, port state, priorities, class, grandmaster, distance,
// offset and path delay.

namespace corbel {

namespace {

struct Column {
    const char* heading;
    kxSysAttributeTagID tag;
};

constexpr Column kColumns[] = {
    {"DOMAIN", kxQvDomainNumber},
    {"PORT STATE", kxQvPortState},
    {"PRIORITY1", kxQvPriority1},
    {"PRIORITY2", kxQvPriority2},
    {"CLOCK CLASS", kxQvClockClass},
    {"GRANDMASTER", kxQvGrandmasterIdentity},
    {"STEPS", kxQvStepsRemoved},
    {"OFFSET", kxQvOffsetFromMaster},
    {"MEAN PATH DELAY", kxQvMeanPathDelay},
};

std::vector<kxSysAttributeTagID> columnTags() {
    std::vector<kxSysAttributeTagID> tags;
    for (const Column& column : kColumns) {
        tags.push_back(column.tag);
    }
    return tags;
}

}  // namespace

ExitCode runSummary(const Options& options) {
    CommandContext context(options);
    ExitCode code = ExitCode::kSuccess;
    if (!context.open(true, code)) {
        return code;
    }
    Table table;
    std::vector<std::string> headings = {"ITEM"};
    for (const Column& column : kColumns) {
        headings.emplace_back(column.heading);
    }
    table.add(headings);
    nlohmann::ordered_json document = nlohmann::ordered_json::object();
    for (const ClockPort& port : context.discover("show", code)) {
        const ItemReading reading = context.reader().read(port.item, columnTags());
        code = worse(code, context.reportReading(reading, false));
        document[port.item] = itemJson(reading);
        std::vector<std::string> row = {port.item};
        for (const Column& column : kColumns) {
            const auto value = reading.values.find(column.tag);
            row.push_back(value == reading.values.end() ? "-"
                                                        : valueText(column.tag, value->second));
        }
        table.add(row);
    }
    if (options.json) {
        context.out().printJson(document);
    } else if (document.size() > 0) {
        table.print();
    }
    return code;
}

}  // namespace corbel
