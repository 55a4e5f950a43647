#include <gtest/gtest.h>
#include <httplib.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <nlohmann/json.hpp>
#include <thread>

#include "tests/corbel/serve/ChildProcess.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

// corbel serve in the client namespace of a private network of a ptp4l clock (refuses SET)
// and a ptpd clock (takes SET), as a user and Prometheus see it.

namespace {

using nlohmann::json;
using namespace std::chrono_literals;
using qvtest::TestNetwork;

const std::string kPtp4l = "02-11-22-FF-FE-33-44-55:1";
const std::string kPtpd = "02-11-22-FF-FE-33-44-77:1";
const std::string kToken = "0123456789abcdef0123456789abcdef";
// What changes from one read to the next, or while a lone clock settles.
const std::set<std::string> kChanging = {"time",         "offsetFromMaster",     "meanPathDelay",
                                         "portState",    "parentOffsetVariance", "portEnabled",
                                         "stepsRemoved", "parentPhaseChangeRate"};

// Calls `get` until `done` holds for its JSON answer, for at most `limit`.
json awaitJson(const std::function<httplib::Result()>& get,
               const std::function<bool(const json&)>& done, std::chrono::seconds limit) {
    json last;
    for (auto until = std::chrono::steady_clock::now() + limit;
         std::chrono::steady_clock::now() < until; std::this_thread::sleep_for(250ms)) {
        const auto result = get();
        last = result ? json::parse(result->body, nullptr, false) : json();
        if (result && result->status == 200 && done(last)) {
            break;
        }
    }
    return last;
}

// The management ids of every SET and COMMAND that went to br0 while `action` ran.
std::string requestsSentDuring(const TestNetwork& network, const std::function<void()>& action) {
    const std::string file = "/tmp/qv-serve-" + network.prefix() + ".pcap";
    std::thread capture(
        [&] { network.runInClient("timeout 3 tcpdump -U -i br0 -w " + file + " udp port 320"); });
    for (int i = 0; i < 100 && qvtest::runCommand("test -s " + file).exitStatus != 0; ++i) {
        std::this_thread::sleep_for(20ms);
    }
    action();
    capture.join();
    return qvtest::runCommand("tshark -r " + file +
                              " -Y 'ptp.v2.mm.action == 1 || ptp.v2.mm.action == 3' -T fields -e "
                              "ptp.v2.mm.managementId 2>/dev/null; rm -f " +
                              file)
        .output;
}

TEST(ServeOnRealClocks, ShowsTheClocksWritesWithTheTokenOnlyAndFeedsPrometheus) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "tcpdump", "tshark", "prometheus");
    TestNetwork network({"ptp4l:domain=0:prio1=100:desc=alpha:mac=02:11:22:33:44:55",
                         "ptpd:domain=2:prio1=90:mac=02:11:22:33:44:77"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    const std::filesystem::path folder = "/tmp/qv-serve-" + network.prefix();
    std::filesystem::create_directories(folder);
    std::ofstream(folder / "token") << kToken << "\n";
    const std::vector<std::string> inClient = {"ip", "netns", "exec", network.clientNamespace()};
    auto command = inClient;
    command.insert(command.end(), {QV_CORBEL_PROGRAM, "--wait", "300", "serve", "--token-file",
                                   (folder / "token").string()});
    qvtest::ChildProcess serve(command, folder / "serve.log");
    qvtest::NetworkNamespaceEntry inClientNamespace(network.clientNamespace());
    ASSERT_TRUE(inClientNamespace.entered()) << inClientNamespace.failure();
    httplib::Client api("127.0.0.1", 8588);
    const json clocks = awaitJson([&] { return api.Get("/api/v1/clocks"); },
                                  [](const json& answer) {
                                      return answer["clocks"].size() == 2 &&
                                             !answer["clocks"][1]["lastRead"].is_null();
                                  },
                                  30s)["clocks"];
    ASSERT_EQ(clocks.size(), 2u);
    EXPECT_EQ(clocks[0]["item"], kPtp4l);
    EXPECT_EQ(clocks[1]["values"]["priority1"]["value"], 90);

    // Every value that holds still is what corbel show --json reads, entry for entry.
    for (const std::string& item : {kPtp4l, kPtpd}) {
        SCOPED_TRACE(item);
        const json shown =
            json::parse(network
                            .runInClient(std::string(QV_CORBEL_PROGRAM) +
                                         " --wait 300 show --json " + item + " 2>/dev/null")
                            .output)[item];
        const json served = json::parse(api.Get("/api/v1/clocks/" + item)->body)["values"];
        EXPECT_GE(shown.size(), 40u);
        for (const auto& [name, entry] : shown.items()) {
            if (!kChanging.contains(name)) {
                EXPECT_EQ(served[name], entry) << name;
            }
        }
    }

    // Without the token nothing reaches the clock; with it the clock takes the value.
    const std::string settings = "/api/v1/clocks/" + kPtpd + "/settings";
    const std::string body = R"({"priority1": 60})";
    EXPECT_EQ(
        requestsSentDuring(
            network, [&] { EXPECT_EQ(api.Post(settings, body, "application/json")->status, 401); }),
        "");
    const httplib::Headers bearer = {{"Authorization", "Bearer " + kToken}};
    EXPECT_NE(requestsSentDuring(network,
                                 [&] {
                                     const auto written =
                                         api.Post(settings, bearer, body, "application/json");
                                     EXPECT_EQ(written->status, 200) << written->body;
                                 }),
              "");
    EXPECT_EQ(json::parse(api.Get("/api/v1/clocks/" + kPtpd)->body)["values"]["priority1"]["value"],
              60);

    // A real Prometheus scraping every second has a series of the offset of each clock.
    std::ofstream(folder / "prometheus.yml")
        << "global: {scrape_interval: 1s}\n"
           "scrape_configs: [{job_name: corbel, static_configs: [{targets: "
           "['127.0.0.1:8588']}]}]\n";
    auto promCommand = inClient;
    promCommand.insert(promCommand.end(),
                       {"prometheus", "--config.file=" + (folder / "prometheus.yml").string(),
                        "--storage.tsdb.path=" + (folder / "data").string(),
                        "--web.listen-address=127.0.0.1:9090"});
    qvtest::ChildProcess prometheus(promCommand, folder / "prometheus.log");
    httplib::Client query("127.0.0.1", 9090);
    const json series =
        awaitJson([&] { return query.Get("/api/v1/query?query=ptp_offset_from_master_seconds"); },
                  [](const json& answer) { return answer["data"]["result"].size() == 2; },
                  40s)["data"]["result"];
    ASSERT_EQ(series.size(), 2u) << series;
    std::set<std::string> items = {series[0]["metric"]["item"], series[1]["metric"]["item"]};
    EXPECT_EQ(items, (std::set<std::string>{kPtp4l, kPtpd}));
    prometheus.stop();
    // ptp4l refused TIME and UTC_PROPERTIES once, and was not asked for them again.
    EXPECT_NE(
        api.Get("/metrics")->body.find("corbel_exchanges_failed_total{reason=\"refused\"} 2\n"),
        std::string::npos);

    EXPECT_EQ(serve.stop(), 0);  // SIGTERM ends it cleanly
    std::filesystem::remove_all(folder);
}

}  // namespace
