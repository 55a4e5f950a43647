#ifndef QV_CORBEL_COMMANDS_H
#define QV_CORBEL_COMMANDS_H

#include <string>
#include <vector>

#include "corbel/CommandContext.h"
#include "corbel/ExitCode.h"
#include "corbel/PropertyValue.h"

namespace corbel {

ExitCode runInfo(const Options& options);
ExitCode runList(const Options& options);
ExitCode runItems(const Options& options);
ExitCode runShow(const Options& options, const std::string& item,
                 const std::vector<std::string>& tags);
ExitCode runSet(const Options& options, const std::string& item,
                const std::vector<std::string>& assignments);

// An item in JSON: an object keyed by tag ("0xE006000"), each entry {"name", "type",
// "settable", "value"}.
nlohmann::json itemJson(const PropertyValues& values);

}  // namespace corbel

#endif
