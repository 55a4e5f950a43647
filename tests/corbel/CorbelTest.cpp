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
    EXPECT_EQ(corbel("list").output, kPtp4l + "\n" + kPtpd + "\n");

    const auto items = corbel("items --json");
    ASSERT_EQ(items.exitStatus, 0) << items.output;
    const json document = json::parse(items.output);
    ASSERT_EQ(document.size(), 2u);
    for (const auto& [item, tags] : document.items()) {
        EXPECT_EQ(tags["0x101D000"]["value"], item);
        EXPECT_EQ(tags["0x102C000"]["value"], item == kPtp4l ? "169.254.1.1" : "169.254.1.2");
    }
    EXPECT_EQ(document[kPtp4l]["0xE003000"]["value"], "alpha");
}

TEST_F(Corbel, ShowsTypedValuesAndWritesPriority1OnPtpd) {
    QV_REQUIRE_CORBEL_NETWORK();
    const auto shown = corbel("show --json " + kPtpd);
    const json clock = json::parse(shown.output)[kPtpd];
    EXPECT_EQ(clock["0xE006000"],
              json({{"name", "priority1"}, {"type", "u32"}, {"settable", true}, {"value", 90}}));
    EXPECT_EQ(clock["0xE005000"]["value"], 2);

    EXPECT_EQ(corbel("set " + kPtpd + " priority1=60").exitStatus, 0);
    const auto after = corbel("show --json " + kPtpd + " 0xE006000");
    EXPECT_EQ(json::parse(after.output), json::parse(R"({")" + kPtpd + R"(": {"0xE006000":
        {"name": "priority1", "type": "u32", "settable": true, "value": 60}}})"));
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
        {"set " + kPtp4l + " priority1=50", 4, "refused by the clock: NOT_SUPPORTED"},
        {"show 02-11-22-FF-FE-00-00-01:1", 1, "no clock answers to the item name"},
        {"show " + kPtpd + " priority7", 2, "unknown tag 'priority7'"},
        {"set " + kPtpd + " stepsRemoved=1", 2, "stepsRemoved cannot be set"},
        {"--expert /nonexistent/libqv1588.so info", 5, "cannot load the expert library"},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.arguments);
        const auto result = corbel(test.arguments, true);
        EXPECT_EQ(result.exitStatus, test.exitStatus);
        EXPECT_NE(result.output.find(test.said), std::string::npos) << result.output;
    }
    // ptp4l answers neither TIME nor UTC_PROPERTIES: the rest shows, the code says it.
    const auto partial = corbel("show --json " + kPtp4l);
    EXPECT_EQ(partial.exitStatus, 4);
    EXPECT_EQ(json::parse(partial.output)[kPtp4l]["0xE006000"]["value"], 100);
}

}  // namespace
