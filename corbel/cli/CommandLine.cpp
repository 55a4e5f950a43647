#include "corbel/cli/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <charconv>
#include <cstdio>
#include <string_view>

#include "corbel/ExpertSession.h"
#include "corbel/cli/Output.h"

namespace corbel {

namespace {

const char* const kDescription =
    "corbel: finds the IEEE 1588 (PTP) clocks of the network through the qv-1588 expert, "
    "shows their settings and changes them.";

const char* const kFooter = R"(Exit codes:
  0  success
  1  nothing found: no clock answered, or none answers to the item name
  2  bad usage: unknown command, option or tag, or a value that does not parse
  3  rejected: the expert's validation refused a value (its sentences are shown)
  4  failed: a clock refused a request or did not answer, or discovery failed
  5  the expert library cannot be loaded or started (binding the PTP ports needs root)

"corbel COMMAND --help" shows a command's options; "man corbel" tells the whole story.
Bash completes commands, options and tag names once the package is installed.)";

const char* const kSetFooter =
    R"(What happens: the expert validates the new values first, and nothing is sent when it
rejects one (exit code 3, its sentences are shown). Then it writes them to the clock, one
request per tag in ascending tag order (the order of "corbel tags"), and stops at the
first one that the clock refuses or does not answer: the tags before it stay written, the
ones after it are not sent, and corbel names all three (exit code 4).)";

const char* const kShowFooter =
    R"~(Each ITEM's tags are read from the clock one dataset at a time. A dataset the clock does
not support (ptp4l: the time and the UTC properties) shows "(not supported by this clock)"
and the command still succeeds, unless a TAG of it was named. * marks the tags that
"corbel set" changes. With no ITEM: every clock that answers, a row each.)~";

const char* const kWatchFooter =
    R"(Discovers once, then reads every clock each interval. On a terminal: a live table, redrawn
in place, with the changes since the last sample. Elsewhere (a pipe, a file, --json): one
line, or one JSON object, per clock and sample, for a log or a plot. Discovers again every
ten samples (every ten seconds at most) to notice clocks that appear; a clock that stops
answering shows so. Ctrl-C ends it with exit code 0.)";

// A number option's check: the text must be a number (a whole one when `whole`) within
// `low` to `high`, or the message says which of these it is not.
CLI::Validator numberCheck(const std::string& unit, double low, double high, bool whole) {
    return CLI::Validator(
        [=](std::string& text) -> std::string {
            double value = 0;
            const auto parsed = std::from_chars(text.data(), text.data() + text.size(), value);
            const bool number = !text.empty() && parsed.ec == std::errc() &&
                                parsed.ptr == text.data() + text.size();
            if (!number || (whole && value != static_cast<double>(static_cast<long long>(value)))) {
                return "'" + text + "' is not " + (whole ? "a whole number" : "a number") + " of " +
                       unit;
            }
            if (value < low || value > high) {
                char range[64];
                std::snprintf(range, sizeof range, "%g to %g", low, high);
                return "'" + text + "' is out of range: " + range + " " + unit;
            }
            return {};
        },
        "", "number");
}

// Adds each option to the top level and to every command it applies to, so that it may
// stand before or after the command word, and each command's help lists its own.
class Parser {
  public:
    explicit Parser(Invocation& invocation)
        : app_(kDescription, "corbel"), options_(invocation.options) {}

    CLI::App& app() { return app_; }

    void expert(CLI::App* app) {
        app->add_option(
               "--expert", options_.expertPath,
               "the expert library to load (default: " + ExpertSession::defaultLibraryPaths() + ")")
            ->type_name("PATH");
    }
    void json(CLI::App* app) {
        app->add_flag("--json", options_.json, "print JSON; errors go to standard error");
    }
    void verbose(CLI::App* app) {
        app->add_flag("--verbose", options_.verbose,
                      "the expert's trace on standard error, and internal numbers in errors");
    }
    void network(CLI::App* app) {
        app->add_option("--wait", options_.waitMilliseconds,
                        "milliseconds that discovery waits for answers (default 1000)")
            ->type_name("MS")
            ->check(numberCheck("milliseconds", 0, 65535, true));
        app->add_option("--interface", options_.interfaces,
                        "the network interface to use (a name, or its index), repeatable; "
                        "\"all\" for every one (default: the stored setting, else the "
                        "system's default)")
            ->type_name("NAME")
            ->allow_extra_args(false);
        verbose(app);
    }
    void domain(CLI::App* app) {
        app->add_option("--domain", options_.domain, "only the clocks of this PTP domain")
            ->type_name("N")
            ->check(numberCheck("a domain", 0, 255, true));
    }
    void all(CLI::App* app) {
        app->add_flag("--all", options_.all,
                      "also the host's constant base properties (itemName, tag1001000, ...)");
    }

    void sampling(CLI::App* app) {
        app->add_option("--interval", options_.intervalSeconds,
                        "seconds between samples (default 1)")
            ->type_name("S")
            ->check(numberCheck("seconds", 0.1, 86400, false));
        app->add_option("--count", options_.count, "end after N samples (default: Ctrl-C)")
            ->type_name("N")
            ->check(numberCheck("samples", 1, 1e9, true));
    }

  private:
    CLI::App app_;
    Options& options_;
};

struct CommandSpec {
    Command command;
    CLI::App* app;
};

#ifdef QV_CORBEL_SERVE
// corbel serve's own options.
void serveOptions(CLI::App* serve, ServeOptions& options) {
    serve->add_option("--listen", options.listen, "address and port to listen on")
        ->type_name("ADDR:PORT")
        ->capture_default_str();
    serve->add_option("--interval", options.interval, "seconds between two reads of every clock")
        ->type_name("S")
        ->check(numberCheck("seconds", 1, 3600, true))
        ->capture_default_str();
    serve->add_option("--rediscover", options.rediscover, "seconds between two discoveries")
        ->type_name("S")
        ->check(numberCheck("seconds", 1, 86400, true))
        ->capture_default_str();
    serve->add_flag("--read-only", options.readOnly, "refuse every write");
    serve
        ->add_option("--token-file", options.tokenFile,
                     "the token that writes need, on the file's first line (else "
                     "CORBEL_SERVE_TOKEN, else one is made and printed at start)")
        ->type_name("FILE");
    serve
        ->add_option("--allow-host", options.allowHosts,
                     "a further name that requests may give as Host (repeatable)")
        ->type_name("NAME")
        ->allow_extra_args(false);
}

const char* const kServeFooter =
    R"(Runs until SIGTERM or Ctrl-C. One thread reads every clock each interval and keeps the
last hour of each; HTTP requests read what it published: GET /api/v1/status, /api/v1/clocks,
/api/v1/clocks/ITEM, /api/v1/clocks/ITEM/history, /api/v1/events?since=ID, /metrics (for
Prometheus), / (the explorer page); POST /api/v1/clocks/ITEM/settings with the header
"Authorization: Bearer TOKEN" writes. Requests must name the server in their Host header.)";
#endif

std::vector<CommandSpec> addCommands(Parser& parser, Invocation& invocation) {
    std::vector<std::string>& arguments = invocation.arguments;
    CLI::App& app = parser.app();
    const auto add = [&](const char* name, const std::string& description) {
        CLI::App* command = app.add_subcommand(name, description);
        command->footer("");  // the exit codes stand in the main help only
        command->group("Commands");
        return command;
    };
    auto* info = add("info", "the expert library: name, version, identifier, file");
    auto* version = add("version", "the versions of corbel and of the expert library");
    auto* list = add("list", "the clock ports that answer, with their PTP domains");
    auto* items = add("items", "every clock port's addresses, product, user description, profile");
    auto* tags = add("tags", "the tags corbel knows: name, number, type, whether settable");
    auto* show = add("show", "a clock port's settings; no ITEM: one table of every clock");
    show->footer(kShowFooter);
    auto* set = add("set", "writes new values to a clock port, in ascending tag order");
    set->footer(kSetFooter);
    auto* watch = add("watch", "port state, offset, delay and grandmaster, sampled");
    watch->footer(kWatchFooter);
    for (CLI::App* command : {info, version, list, items, show, set, watch}) {
        parser.expert(command);
    }
    for (CLI::App* command : {info, version, list, items, tags, show, set, watch}) {
        parser.json(command);
    }
    parser.verbose(info);
    for (CLI::App* command : {list, items, show, set, watch}) {
        parser.network(command);
    }
    for (CLI::App* command : {list, items, show, watch}) {
        parser.domain(command);
    }
    parser.all(show);
    parser.sampling(watch);
    show->add_option("ITEM", arguments,
                     "item names (02-11-22-FF-FE-33-44-55:1), then tag names (priority1) or "
                     "numbers (0xE006000); no tag: every tag")
        ->type_name("[TAG]");
    set->add_option("ITEM", arguments,
                    "the item name, then NAME=VALUE: integers, doubles, true/false/1/0, "
                    "text, UTC times as 2026-12-06T20:15:00Z")
        ->type_name("NAME=VALUE")
        ->required();
    watch->add_option("ITEM", arguments, "the item names to watch (default: every clock)")
        ->type_name("");
    std::vector<CommandSpec> commands = {{Command::info, info}, {Command::version, version},
                                         {Command::list, list}, {Command::items, items},
                                         {Command::tags, tags}, {Command::show, show},
                                         {Command::set, set},   {Command::watch, watch}};
#ifdef QV_CORBEL_SERVE
    auto* serve = add("serve", "the clocks as a live HTTP API, Prometheus metrics and a page");
    serve->footer(kServeFooter);
    parser.expert(serve);
    parser.network(serve);
    serveOptions(serve, invocation.serve);
    commands.push_back({Command::serve, serve});
#endif
    return commands;
}

// CLI11's words for an argument that no option takes, in ours.
std::string usageMessage(const CLI::ParseError& error) {
    const std::string text = error.what();
    for (const std::string_view prefix : {"The following argument was not expected: ",
                                          "The following arguments were not expected: "}) {
        if (text.starts_with(prefix)) {
            const std::string word = text.substr(prefix.size());
            return (word.starts_with("-") ? "unknown option '" : "unexpected argument '") + word +
                   "'";
        }
    }
    return text;
}

bool asksForJson(int argc, const char* const* argv) {
    return std::any_of(argv + 1, argv + argc,
                       [](const char* word) { return std::string_view(word) == "--json"; });
}

ExitCode reportUsage(const std::string& message, const std::string& helpCommand, bool json) {
    Output(json).error("usage", message + " (" + helpCommand + " shows the usage)");
    return ExitCode::kBadUsage;
}

}  // namespace

Invocation parseCommandLine(int argc, const char* const* argv) {
    Invocation invocation;
    Parser parser(invocation);
    CLI::App& app = parser.app();
    app.footer(kFooter);
    app.get_formatter()->label("SUBCOMMAND", "COMMAND");
    app.get_formatter()->label("Positionals", "Arguments");
    app.require_subcommand(0, 1);
    bool version = false;
    app.add_flag("--version", version, "print corbel's version and end");
    parser.expert(&app);
    parser.json(&app);
    parser.network(&app);
    const auto commands = addCommands(parser, invocation);
    app.allow_extras();  // after the commands, which do not inherit it: see below
    const bool json = asksForJson(argc, argv);
    try {
        app.parse(argc, argv);
    } catch (const CLI::CallForHelp& help) {
        app.exit(help);
        invocation.finished = ExitCode::kSuccess;
        return invocation;
    } catch (const CLI::ParseError& error) {
        const auto chosen = app.get_subcommands();
        invocation.finished = reportUsage(
            usageMessage(error),
            chosen.empty() ? "corbel --help" : "corbel " + chosen.front()->get_name() + " --help",
            json);
        return invocation;
    }
    if (version) {
        std::printf("corbel %s\n", QV_CORBEL_VERSION);
        invocation.finished = ExitCode::kSuccess;
        return invocation;
    }
    // Extras are allowed at the top level only to tell an unknown command from the rest.
    const std::vector<std::string> extras = app.remaining();
    if (!extras.empty()) {
        const std::string& word = extras.front();
        invocation.finished = reportUsage(word.starts_with("-") ? "unknown option '" + word + "'"
                                                                : "unknown command '" + word + "'",
                                          "corbel --help", json);
        return invocation;
    }
    for (const CommandSpec& candidate : commands) {
        if (candidate.app->parsed()) {
            invocation.command = candidate.command;
            return invocation;
        }
    }
    invocation.finished = reportUsage("no command given", "corbel --help", json);
    return invocation;
}

}  // namespace corbel
