#ifndef QV_CORBEL_CLI_COMMANDS_H
#define QV_CORBEL_CLI_COMMANDS_H

#include <string>
#include <vector>

#include "corbel/ExitCode.h"
#include "corbel/cli/CommandLine.h"

namespace corbel {

// One function per command; `arguments` are the command's words as given.
ExitCode runInfo(const Options& options);
ExitCode runVersion(const Options& options);
ExitCode runTags(const Options& options);
ExitCode runList(const Options& options);
ExitCode runItems(const Options& options);
ExitCode runShow(const Options& options, const std::vector<std::string>& arguments);
ExitCode runSummary(const Options& options);  // show without an item
ExitCode runSet(const Options& options, const std::vector<std::string>& arguments);
ExitCode runWatch(const Options& options, const std::vector<std::string>& arguments);

}  // namespace corbel

#endif
