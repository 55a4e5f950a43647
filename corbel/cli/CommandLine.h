#ifndef QV_CORBEL_CLI_COMMANDLINE_H
#define QV_CORBEL_CLI_COMMANDLINE_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "corbel/ExitCode.h"
#include "corbel/serve/ServeOptions.h"

namespace corbel {

enum class Command { info, version, list, items, tags, show, set, watch, serve };

// Every option of a run; each command's parser offers only the ones that apply to it.
struct Options {
    std::string expertPath;                         // --expert
    std::optional<std::uint32_t> waitMilliseconds;  // --wait
    std::vector<std::string> interfaces;            // --interface (names, or "all")
    std::optional<unsigned> domain;                 // --domain
    bool json = false;                              // --json
    bool verbose = false;                           // --verbose
    bool all = false;                               // --all
    double intervalSeconds = 1.0;                   // --interval (watch)
    std::optional<unsigned> count;                  // --count (watch)
};

// What the command line asks for.
struct Invocation {
    Command command = Command::info;
    Options options;
    std::vector<std::string> arguments;  // the command's words: items, tags, NAME=VALUE
    ServeOptions serve;                  // corbel serve's own options
    // Set when the run is already over: help or the version was printed, or a usage error
    // was reported (as JSON with --json).
    std::optional<ExitCode> finished;
};

Invocation parseCommandLine(int argc, const char* const* argv);

}  // namespace corbel

#endif
