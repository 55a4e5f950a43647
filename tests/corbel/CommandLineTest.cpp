#include <gtest/gtest.h>

#include <string>

#include "tests/support/TestNetwork.h"

// corbel's answers to a command line that it refuses or that needs no clock: no network,
// no expert beyond loading it. Each row: what a user types, the exit code, a text that
// must be in the output (standard output and error together) and one that must not.

namespace {

TEST(CommandLine, SaysWhatIsWrongAndEndsWithTheDocumentedCode) {
    const std::string item = "02-11-22-FF-FE-33-44-55:1";
    const struct {
        std::string arguments;
        int exitStatus;
        std::string said, notSaid;
    } cases[] = {
        {"frob", 2, "corbel: unknown command 'frob' (corbel --help shows the usage)", ""},
        {"", 2, "corbel: no command given", ""},
        {"--json frob", 2, R"({"error":"usage","message":"unknown command 'frob')", "corbel:"},
        {"--wait abc list", 2, "--wait: 'abc' is not a whole number of milliseconds", ""},
        {"list --bogus", 2, "unknown option '--bogus' (corbel list --help", ""},
        {"watch --interval 0", 2, "'0' is out of range: 0.1 to 86400 seconds", ""},
        {"set " + item + " time=1969-12-31T23:59:59Z", 2,
         "time takes a time from 1970-01-01T00:00:00Z to 8921556-12-07T10:44:15Z", ""},
        {"set " + item + " priority1=x", 2, "priority1 takes a whole number from 0 to", ""},
        {"set " + item + " stepsRemoved=1", 2, "stepsRemoved cannot be set", ""},
        {"set " + item + " priority1=1 priority1=2", 2, "priority1 is given twice", ""},
        {"show " + item + " priority7", 2, "'priority7' is neither an item name", ""},
        {"--interface no-such-if --expert /nonexistent/libqv1588.so list", 2,
         "--interface no-such-if: no such interface", ""},
        {"--version", 0, "corbel " QV_CORBEL_VERSION "\n", ""},
        {"--help", 0, "Exit codes:", ""},
        {"--help", 0, "man corbel", ""},
        {"set --help", 0, "in ascending tag order", "Exit codes"},
        {"list --help", 0, "--domain N", "Exit codes"},
        {"watch --help", 0, "--interval S", "--all"},
        {"tags", 0, "*  priority1", ""},
        {"tags --json", 0, R"("priority1": {
    "tag": "0xE006000",
    "type": "u32",
    "settable": true
  })",
         ""},
        {"--expert /nonexistent/libqv1588.so version", 5, "corbel  " QV_CORBEL_VERSION, ""},
        {"--expert /nonexistent/libqv1588.so info", 5, "cannot load the expert library", ""},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.arguments);
        const auto result =
            qvtest::runCommand(std::string(QV_CORBEL_PROGRAM) + " " + test.arguments);
        EXPECT_EQ(result.exitStatus, test.exitStatus);
        EXPECT_NE(result.output.find(test.said), std::string::npos) << result.output;
        if (!test.notSaid.empty()) {
            EXPECT_EQ(result.output.find(test.notSaid), std::string::npos) << result.output;
        }
    }
}

}  // namespace
