#include <gtest/gtest.h>

#include <memory>
#include <nlohmann/json.hpp>
#include <string>

#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

// corbel as a user runs it, in the client namespace of a private network with a ptp4l clock
// (refuses SET) and a ptpd clock (accepts SET).

namespace {

using nlohmann::json;
using qvtest::TestNetwork;

const std::string kPtp4l = "02-11-22-FF-FE-33-44-55:1";
const std::string kPtpd = "02-11-22-FF-FE-33-44-77:1";

class Corbel : public ::testing::Test {
  protected:
    static void SetUpTestSuite() {
        if (qvtest::testNetworkUnavailableReason({"ptp4l", "ptpd"}).empty()) {
            network_ = std::make_unique<TestNetwork>(std::vector<std::string>{
                "ptp4l:domain=0:prio1=100:desc=alpha:mac=02:11:22:33:44:55",
                "ptpd:domain=2:prio1=90:mac=02:11:22:33:44:77"});
        }
    }
    static void TearDownTestSuite() { network_.reset(); }

    // The command's exit code and its standard output, or its standard error alone.
    static qvtest::CommandResult corbel(const std::string& arguments, bool errors = false) {
        return network_->runInClient(std::string(QV_CORBEL_PROGRAM) + " --wait 300 " + arguments +
                                     (errors ? " 2>&1 >/dev/null" : " 2>/dev/null"));
    }

    static std::unique_ptr<TestNetwork> network_;
};

std::unique_ptr<TestNetwork> Corbel::network_;

#define QV_REQUIRE_CORBEL_NETWORK()           \
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd"); \
    ASSERT_TRUE(network_ && network_->isUp()) << (network_ ? network_->failure() : "")

TEST_F(Corbel, ListsAndDescribesEveryClockInJson) {
    QV_REQUIRE_CORBEL_NETWORK();
    EXPECT_EQ(corbel("list").output,
              "ITEM                       DOMAIN\n" + kPtp4l + "  0\n" + kPtpd + "  2\n");
    const auto none = corbel("list --json --domain 3");
    EXPECT_EQ(none.exitStatus, 1);
    EXPECT_EQ(none.output, "[]\n");

    const auto items = corbel("items --json");
    ASSERT_EQ(items.exitStatus, 0) << items.output;
    const json document = json::parse(items.output);
    ASSERT_EQ(document.size(), 2u);
    EXPECT_EQ(document[kPtp4l]["networkAddress"]["value"], "169.254.1.1");
    EXPECT_EQ(document[kPtpd]["domainNumber"]["value"], 2);
    EXPECT_EQ(document[kPtp4l]["userDescription"]["value"], "alpha");
}

TEST_F(Corbel, ShowsWordsAndWritesPriority1OnPtpd) {
    QV_REQUIRE_CORBEL_NETWORK();
    const auto shown = corbel("show --json " + kPtpd);
    const json clock = json::parse(shown.output)[kPtpd];
    EXPECT_EQ(clock["delayMechanism"]["word"], "E2E");
    EXPECT_EQ(clock["offsetFromMaster"]["unit"], "ns");
    EXPECT_FALSE(clock.contains("tag1001000"));

    EXPECT_EQ(corbel("set " + kPtpd + " priority1=60").exitStatus, 0);
    const auto after = corbel("show --json " + kPtpd + " 0xE006000");
    EXPECT_EQ(json::parse(after.output), json::parse(R"({")" + kPtpd + R"(": {"priority1":
        {"tag": "0xE006000", "type": "u32", "value": 60, "settable": true}}})"));
}

// ptp4l answers neither TIME nor UTC_PROPERTIES: a normal answer, shown as such.
TEST_F(Corbel, ShowsWhatPtp4lDoesNotSupportAndSucceeds) {
    QV_REQUIRE_CORBEL_NETWORK();
    const auto shown = corbel("show " + kPtp4l);
    EXPECT_EQ(shown.exitStatus, 0) << shown.output;
    for (const char* row : {"*  time                      (not supported by this clock)",
                            "   leap59                    (not supported by this clock)",
                            "*  priority1                 100"}) {
        EXPECT_NE(shown.output.find(row), std::string::npos) << row << "\n" << shown.output;
    }
}

TEST_F(Corbel, WatchGivesOneJsonSamplePerClockAndIntervalAndEndsOnCtrlC) {
    QV_REQUIRE_CORBEL_NETWORK();
    const auto watched = network_->runInClient(
        std::string(QV_CORBEL_PROGRAM) +
        " --wait 300 watch --json --interval 0.2 --count 3 > /tmp/$$.json && "
        "while read -r line; do echo \"$line\" | python3 -m json.tool >/dev/null || exit 9; "
        "echo \"$line\" | grep -o '\"item\": *\"[^\"]*\"'; done < /tmp/$$.json; rm /tmp/$$.json");
    EXPECT_EQ(watched.exitStatus, 0) << watched.output;
    const std::string ptp4l = "\"item\":\"" + kPtp4l + "\"\n";
    const std::string ptpd = "\"item\":\"" + kPtpd + "\"\n";
    EXPECT_EQ(watched.output, ptp4l + ptpd + ptp4l + ptpd + ptp4l + ptpd);

    // Ctrl-C once the first sample is out (a shell's background job ignores SIGINT unless
    // the program handles it, as watch does).
    const auto stopped = network_->runInClient(
        std::string(QV_CORBEL_PROGRAM) +
        " --wait 300 watch > /tmp/$$.txt & pid=$!; until grep -q . /tmp/$$.txt; do sleep 0.1; "
        "done; kill -INT $pid; wait $pid; code=$?; rm /tmp/$$.txt; exit $code");
    EXPECT_EQ(stopped.exitStatus, 0) << stopped.output;
}

TEST_F(Corbel, EndsWithTheDocumentedCodeAndSaysWhyOnStandardError) {
    QV_REQUIRE_CORBEL_NETWORK();
    const struct {
        std::string arguments;
        int exitStatus;
        std::string said;
    } cases[] = {
        {"set " + kPtpd + " priority1=300 domainNumber=7", 3,
         "Domain must be an integer within the range 0 (PTP default domain) to 3.\n"
         "  Priority values must be integers within the range 0-255."},
        {"set " + kPtp4l + " priority1=50 userDescription=x priority2=1", 4,
         "the clock refused userDescription: not supported by this clock (NOT_SUPPORTED)\n"
         "  written: nothing\n  not sent: priority1, priority2"},
        {"show 02-11-22-FF-FE-00-00-01:1", 1, "no clock answers to the item name"},
        {"show " + kPtpd + " priority7", 2, "'priority7' is neither an item name"},
        {"--expert /nonexistent/libqv1588.so info", 5, "cannot load the expert library"},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.arguments);
        const auto result = corbel(test.arguments, true);
        EXPECT_EQ(result.exitStatus, test.exitStatus);
        EXPECT_NE(result.output.find(test.said), std::string::npos) << result.output;
    }
    // A tag named explicitly that the clock does not give fails the command.
    const auto named = corbel("show --json " + kPtp4l + " priority1 time");
    EXPECT_EQ(named.exitStatus, 4);
    EXPECT_EQ(json::parse(named.output)[kPtp4l]["time"]["reason"], "NOT_SUPPORTED");
}

}  // namespace

namespace {

// No clock behind two bridges: the message names both and the option that chooses.
TEST(CorbelOnTwoNetworks, NamesTheInterfacesWhenNoClockAnswers) {
    QV_REQUIRE_TEST_NETWORK("ptp4l");
    const TestNetwork network({"none", "none:net=1"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    const auto result =
        network.runInClient(std::string(QV_CORBEL_PROGRAM) + " --wait 300 list 2>&1");
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_NE(result.output.find("this machine has 2 multicast interfaces (br0, br1): choose "
                                 "with --interface NAME, or --interface all"),
              std::string::npos)
        << result.output;
}

}  // namespace
