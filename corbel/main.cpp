// corbel: a command-line host for the qv-1588 expert. It knows the expert only through the
// public header: it loads the library with dlopen, asks createCorbelExpert for the expert
// and drives it as the host framework does, one command per run.

#include <CLI/CLI.hpp>
#include <cstdio>
#include <exception>

#include "corbel/Commands.h"
#include "corbel/ExpertSession.h"
#include "corbel/TagCatalog.h"

namespace {

using corbel::ExitCode;

const char* const kFooter = R"(Exit codes:
  0  success
  1  nothing found: no clock answered, or none answers to the item name
  2  bad usage: unknown command, option or tag, or a value that does not parse
  3  rejected: the expert's validation refused a value (its sentences are shown)
  4  failed: a clock refused a request or did not answer, or discovery failed
  5  the expert library cannot be loaded or started (binding the PTP ports needs root)

Discovery sends a management GET of CLOCK_DESCRIPTION in domains 0 to 3 and waits for
answers: findClocksTimeout milliseconds (default 1000) from $QV_FIND_CLOCKS_TIMEOUT, else
from the file $QV_SETTINGS_ROOT/Software/Quarvel/Corbel/qv-1588/findClocksTimeout (root
/etc/corbel when the variable is unset); --wait sets QV_FIND_CLOCKS_TIMEOUT for one run.)";

void printTags(bool json) {
    nlohmann::json document = nlohmann::json::object();
    corbel::Table table;
    table.add({" ", "NAME", "TAG", "TYPE"});
    for (const corbel::TagInfo& info : corbel::allTags()) {
        document[corbel::tagText(info.tag)] = {{"name", info.name},
                                               {"type", corbel::typeName(info.type)},
                                               {"settable", info.settable}};
        table.add({info.settable ? "*" : " ", info.name, corbel::tagText(info.tag),
                   corbel::typeName(info.type)});
    }
    if (json) {
        corbel::Output(true).printJson(document);
    } else {
        table.print();
        std::printf("(* settable with corbel set)\n");
    }
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app{
        "corbel: finds the PTP clocks of the network through the qv-1588 expert, shows "
        "their settings and changes them."};
    app.footer(kFooter);
    app.require_subcommand(1);
    app.fallthrough();
    corbel::Options options;
    app.add_option("--expert", options.expertPath,
                   "the expert library to load (default: " +
                       corbel::ExpertSession::defaultLibraryPaths() + ")");
    app.add_option("--wait", options.waitMilliseconds,
                   "milliseconds that discovery waits for answers, for this run only")
        ->type_name("MS")
        ->check(CLI::Range(0, 65535));

    std::string item;
    std::vector<std::string> words;
    auto withJson = [&options](CLI::App* command) {
        command->add_flag("--json", options.json, "print JSON; errors go to standard error");
        return command;
    };
    auto* info = withJson(app.add_subcommand("info", "the expert's name, version and identifier"));
    auto* list = withJson(app.add_subcommand("list", "the item names of the clocks that answer"));
    auto* items = withJson(app.add_subcommand(
        "items", "every clock's base properties: addresses, product, user description, profile"));
    auto* tags = withJson(app.add_subcommand("tags", "the tags corbel knows, by name and number"));
    auto* show = withJson(app.add_subcommand(
        "show", "a clock's settings as read from it; every readable tag when none is given"));
    show->add_option("item", item, "item name, e.g. 02-11-22-FF-FE-33-44-55:1")->required();
    show->add_option("tags", words, "tag names (priority1) or numbers (0xE006000)");
    auto* set = app.add_subcommand(
        "set",
        "validates new values, then writes them to the clock in tag order, stopping at the "
        "first one it refuses");
    set->add_option("item", item, "item name, e.g. 02-11-22-FF-FE-33-44-55:1")->required();
    set->add_option("changes", words,
                    "NAME=VALUE: integers, doubles, true/false/1/0, text, "
                    "times as 2026-12-06T20:15:00Z")
        ->required();

    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        const int code = app.exit(error);
        return code == 0 ? 0 : corbel::toInt(ExitCode::kBadUsage);
    }
    try {
        ExitCode code = ExitCode::kSuccess;
        if (*info) {
            code = corbel::runInfo(options);
        } else if (*list) {
            code = corbel::runList(options);
        } else if (*items) {
            code = corbel::runItems(options);
        } else if (*tags) {
            printTags(options.json);
        } else if (*show) {
            code = corbel::runShow(options, item, words);
        } else if (*set) {
            code = corbel::runSet(options, item, words);
        }
        return corbel::toInt(code);
    } catch (const std::exception& error) {
        std::fprintf(stderr, "corbel: %s\n", error.what());
        return corbel::toInt(ExitCode::kFailed);
    }
}
