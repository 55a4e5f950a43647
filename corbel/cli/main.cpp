// corbel: a command-line host for the qv-1588 expert. It knows the expert only through the
// public headers: it loads the library, asks createCorbelExpert for the expert and drives
// it as the host framework does, one command per run.

#include <cstdio>
#include <exception>

#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"
#ifdef QV_CORBEL_SERVE
#include "corbel/serve/ServeCommand.h"
#endif

namespace {

using corbel::Command;
using corbel::ExitCode;

ExitCode run(const corbel::Invocation& invocation) {
    const corbel::Options& options = invocation.options;
    const auto& arguments = invocation.arguments;
    switch (invocation.command) {
        case Command::info:
            return corbel::runInfo(options);
        case Command::version:
            return corbel::runVersion(options);
        case Command::tags:
            return corbel::runTags(options);
        case Command::list:
            return corbel::runList(options);
        case Command::items:
            return corbel::runItems(options);
        case Command::show:
            return arguments.empty() ? corbel::runSummary(options)
                                     : corbel::runShow(options, arguments);
        case Command::set:
            return corbel::runSet(options, arguments);
        case Command::watch:
            return corbel::runWatch(options, arguments);
        case Command::serve: {
#ifdef QV_CORBEL_SERVE
            // The expert opens as for every command (--expert, --wait, --interface,
            // --verbose) and is shut down when the context ends, after the service.
            corbel::CommandContext context(options);
            return corbel::runServe(invocation.serve, [&context](ExitCode& failed) {
                return context.open(true, failed) ? &context.expert() : nullptr;
            });
#else
            return ExitCode::kBadUsage;
#endif
        }
    }
    return ExitCode::kBadUsage;
}

}  // namespace

int main(int argc, char** argv) {
    const corbel::Invocation invocation = corbel::parseCommandLine(argc, argv);
    if (invocation.finished) {
        return corbel::toInt(*invocation.finished);
    }
    try {
        return corbel::toInt(run(invocation));
    } catch (const std::exception& error) {
        std::fprintf(stderr, "corbel: %s\n", error.what());
        return corbel::toInt(ExitCode::kFailed);
    }
}
