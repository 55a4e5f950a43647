#include "corbel/ValueJson.h"
#include "corbel/ValueWords.h"
#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"
#include "corbel/cli/Table.h"

// The commands that list the clock ports: list and items.

namespace corbel {

namespace {

// What items shows of each clock: its description, as discovery and one GET of
// CLOCK_DESCRIPTION give it, and its domain.
const std::vector<kxSysAttributeTagID> kItemTags = {
    kxSysNetworkAddress, kxSysHardwareAddress, kxQvDomainNumber,    kxQvProductDescription,
    kxQvUserDescription, kxQvProfileIdentity,  kxSysOwnManufacturer};

std::string domainText(const ClockPort& port) {
    return port.domain ? std::to_string(*port.domain) : "-";
}

std::string cellOf(const ItemReading& reading, kxSysAttributeTagID tag) {
    const auto found = reading.values.find(tag);
    return found == reading.values.end() ? "-" : valueText(tag, found->second);
}

}  // namespace

ExitCode runList(const Options& options) {
    CommandContext context(options);
    ExitCode code = ExitCode::kSuccess;
    if (!context.open(true, code)) {
        return code;
    }
    const auto ports = context.discover("list", code);
    if (options.json) {
        nlohmann::ordered_json list = nlohmann::ordered_json::array();
        for (const ClockPort& port : ports) {
            list.push_back({{"item", port.item},
                            {"domain", port.domain ? nlohmann::ordered_json(*port.domain)
                                                   : nlohmann::ordered_json(nullptr)}});
        }
        context.out().printJson(list);
        return code;
    }
    if (!ports.empty()) {
        Table table;
        table.add({"ITEM", "DOMAIN"});
        for (const ClockPort& port : ports) {
            table.add({port.item, domainText(port)});
        }
        table.print();
    }
    return code;
}

ExitCode runItems(const Options& options) {
    CommandContext context(options);
    ExitCode code = ExitCode::kSuccess;
    if (!context.open(true, code)) {
        return code;
    }
    std::vector<ItemReading> readings;
    for (const ClockPort& port : context.discover("items", code)) {
        readings.push_back(context.reader().read(port.item, kItemTags));
        code = worse(code, context.reportReading(readings.back(), false));
    }
    if (options.json) {
        nlohmann::ordered_json document = nlohmann::ordered_json::object();
        for (const ItemReading& reading : readings) {
            document[reading.item] = itemJson(reading);
        }
        context.out().printJson(document);
        return code;
    }
    if (readings.empty()) {
        return code;
    }
    Table table;
    table.add({"ITEM", "DOMAIN", "ADDRESS", "MAC", "PRODUCT", "USER DESCRIPTION", "PROFILE"});
    for (const ItemReading& reading : readings) {
        table.add({reading.item, cellOf(reading, kxQvDomainNumber),
                   cellOf(reading, kxSysNetworkAddress), cellOf(reading, kxSysHardwareAddress),
                   cellOf(reading, kxQvProductDescription), cellOf(reading, kxQvUserDescription),
                   cellOf(reading, kxQvProfileIdentity)});
    }
    table.print();
    return code;
}

}  // namespace corbel
