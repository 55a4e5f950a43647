#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "corbel/serve/ServeCommand.h"
#include "tests/corbel/serve/FakeService.h"

// The routes of corbel serve against a published state, without network or poller.

namespace {

using nlohmann::json;
using qvtest::FakeService;
using Headers = std::vector<std::pair<std::string, std::string>>;

const std::string kSettings = "/api/v1/clocks/" + qvtest::kPtp4lItem + "/settings";
const Headers kWrite = {{"Authorization", "Bearer secret"}, {"Content-Type", "application/json"}};

Headers with(Headers headers, const std::string& name, const std::string& value) {
    std::erase_if(headers, [&name](const auto& header) { return header.first == name; });
    if (!value.empty()) {
        headers.emplace_back(name, value);
    }
    return headers;
}

std::string errorOf(const corbel::HttpResponse& response) {
    return json::parse(response.body).value("error", "");
}

TEST(ServeApi, AnswersEachRouteWithItsStatusAndContentType) {
    FakeService service;
    const struct {
        std::string path, host;
        int status;
        std::string contentType;
    } cases[] = {
        {"/api/v1/status", "127.0.0.1:8588", 200, "application/json; charset=utf-8"},
        {"/api/v1/clocks/02-11-22-ff-fe-33-44-55:1", "localhost", 200, "application/json"},
        {"/api/v1/clocks/02-11-22-FF-FE-00-00-01:1", "127.0.0.1", 404, "application/json"},
        {"/api/v1/events?since=x", "[::1]:8588", 400, "application/json"},
        {"/api/v1/clock", "ptp.example", 404, "application/json"},
        {"/metrics", "PTP.example:8588", 200, "text/plain; version=0.0.4; charset=utf-8"},
        {"/", "localhost:8588", 200, "text/html; charset=utf-8"},
        {"/assets/chart.min.js", "127.0.0.1", 200, "text/javascript; charset=utf-8"},
        {"/assets/missing.js", "127.0.0.1", 404, "application/json"},
        // A name another site resolves to this machine, another port, no Host at all.
        {"/api/v1/clocks", "evil.example", 403, "application/json"},
        {"/api/v1/clocks", "127.0.0.1:9999", 403, "application/json"},
        {"/api/v1/clocks", "", 403, "application/json"},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.path + " Host " + test.host);
        const auto response = service.get(test.path, test.host);
        EXPECT_EQ(response.status, test.status) << response.body;
        EXPECT_TRUE(response.contentType.starts_with(test.contentType)) << response.contentType;
        if (test.contentType.starts_with("application/json")) {
            EXPECT_EQ(errorOf(response),
                      test.status == 200 ? "" : corbel::Api::errorWord(test.status));
        }
    }
    EXPECT_EQ(FakeService(false).get("/api/v1/clocks").status, 503);
    EXPECT_EQ(json::parse(FakeService(false).get("/api/v1/status").body)["discovery"], nullptr);
    const auto page = service.get("/");
    using Header = std::pair<std::string, std::string>;
    EXPECT_EQ(page.headers[0], Header("Content-Security-Policy", "default-src 'self'"));
    corbel::HttpRequest many{"GET", "/api/v1/status", {}, {{"Host", "127.0.0.1"}}, ""};
    many.headers.resize(65, {"X-A", "b"});
    EXPECT_EQ(service.api.handle(many).status, 400);
    EXPECT_EQ(
        service.api.handle({"DELETE", "/api/v1/clocks", {}, {{"Host", "localhost"}}, ""}).status,
        405);
}

TEST(ServeApi, ShowsClocksHistoryAndEventsInTheDocumentedShapes) {
    FakeService service;
    const json clocks = json::parse(service.get("/api/v1/clocks").body)["clocks"];
    ASSERT_EQ(clocks.size(), 2u);
    EXPECT_EQ(clocks[0]["values"].size(), 6u);  // the key values it has; not the item name
    EXPECT_EQ(clocks[0]["values"]["priority1"],
              json({{"tag", "0xE006000"}, {"type", "u32"}, {"value", 100}, {"settable", true}}));
    EXPECT_EQ(clocks[1]["present"], false);
    EXPECT_EQ(clocks[1]["domain"], 1);

    const json clock = json::parse(service.get("/api/v1/clocks/" + qvtest::kPtp4lItem).body);
    EXPECT_EQ(clock["lastRead"], "2026-12-06T12:00:00Z");
    EXPECT_EQ(clock["values"]["itemName"]["value"], qvtest::kPtp4lItem);
    EXPECT_EQ(clock["values"]["time"]["value"], nullptr);
    EXPECT_EQ(clock["values"]["time"]["error"], "not supported by this clock");
    EXPECT_EQ(clock["values"]["time"]["reason"], "NOT_SUPPORTED");
    EXPECT_EQ(clock["values"]["portState"]["word"], "MASTER");

    const json history =
        json::parse(service.get("/api/v1/clocks/" + qvtest::kPtp4lItem + "/history").body);
    EXPECT_EQ(history["interval"], 1);
    EXPECT_EQ(history["samples"], json::parse(R"([
        {"time": "2026-12-06T11:59:59Z", "t": 1796558399000, "offsetFromMaster": -10.0,
         "meanPathDelay": 25.0, "portState": 6},
        {"time": "2026-12-06T12:00:00Z", "t": 1796558400000, "offsetFromMaster": null,
         "meanPathDelay": null, "portState": null}])"));

    EXPECT_EQ(json::parse(service.get("/api/v1/events?since=0").body)["events"][0]["kind"],
              "vanished");
    EXPECT_EQ(json::parse(service.get("/api/v1/events?since=1").body),
              json({{"events", json::array()}, {"last", 1}}));
}

TEST(ServeApi, WritesOnlyWithTheTokenFromThisOriginAsJson) {
    FakeService service;
    const struct {
        std::string body;
        Headers headers;
        int status;
    } refusals[] = {
        {R"({"priority1": 60})", with(kWrite, "Authorization", ""), 401},
        {R"({"priority1": 60})", with(kWrite, "Authorization", "Bearer secreT"), 401},
        {R"({"priority1": 60})", with(kWrite, "Authorization", "Bearer secret2"), 401},
        {R"({"priority1": 60})", with(kWrite, "Authorization", "secret"), 401},
        {R"({"priority1": 60})", with(kWrite, "Origin", "http://evil.example"), 403},
        {R"({"priority1": 60})", with(kWrite, "Origin", "null"), 403},
        {R"({"priority1": 60})", with(kWrite, "Content-Type", "text/plain"), 400},
        {R"({"priority1": 60)", kWrite, 400},
        {R"({})", kWrite, 400},
        {R"({"priority7": 60})", kWrite, 400},
        {R"({"stepsRemoved": 1})", kWrite, 400},
        {R"({"priority1": "60"})", kWrite, 400},
        {R"({"priority1": -1})", kWrite, 400},
        {R"({"priority1": 1.5})", kWrite, 400},
        {R"({"slaveOnly": 1})", kWrite, 400},
        {R"({"time": "yesterday"})", kWrite, 400},
        {R"({"priority1": 1, "PRIORITY1": 2})", kWrite, 400},
    };
    for (const auto& test : refusals) {
        SCOPED_TRACE(test.body);
        const auto response = service.post(kSettings, test.body, test.headers);
        EXPECT_EQ(response.status, test.status) << response.body;
        EXPECT_EQ(errorOf(response), corbel::Api::errorWord(test.status));
    }
    EXPECT_TRUE(service.writer.calls.empty());
    // A query parameter is no token.
    EXPECT_EQ(
        service.post(kSettings + "?token=secret", "{}", with(kWrite, "Authorization", "")).status,
        401);
    EXPECT_EQ(FakeService(true, true).post(kSettings, R"({"priority1": 60})", kWrite).status, 403);
    EXPECT_EQ(service.post("/api/v1/clocks/x/settings", R"({"priority1": 60})", kWrite).status,
              404);
    EXPECT_EQ(service
                  .post(kSettings, R"({"priority1": 60})",
                        with(kWrite, "Origin", "http://127.0.0.1:8588"))
                  .status,
              200);
    ASSERT_EQ(service.writer.calls, std::vector<std::string>{qvtest::kPtp4lItem});
    EXPECT_EQ(std::get<std::uint32_t>(service.writer.asked.at(0).value), 60u);
}

TEST(ServeApi, AnswersWhatTheWriteDid) {
    using Result = corbel::WriteOutcome::Result;
    const struct {
        corbel::WriteOutcome outcome;
        int status;
        json expected;
    } cases[] = {
        {{Result::written, {}, {"priority1", "priority2"}, {}, "", "", {}},
         200,
         {{"written", {"priority1", "priority2"}},
          {"refused", nullptr},
          {"notSent", json::array()}}},
        {{Result::rejected, {{"priority1", "Priority values must be ..."}}, {}, {}, "", "", {}},
         422,
         {{"error", "rejected"},
          {"message", "rejected by validation; nothing was sent"},
          {"sentences", {{"priority1", "Priority values must be ..."}}}}},
        {{Result::refused, {}, {"domainNumber"}, {"priority2"}, "priority1", "not supported", {}},
         502,
         {{"error", "refused"},
          {"message", "priority1 refused: not supported"},
          {"written", {"domainNumber"}},
          {"refused", {{"name", "priority1"}, {"reason", "not supported"}}},
          {"notSent", {"priority2"}}}},
    };
    for (const auto& test : cases) {
        FakeService service;
        service.writer.outcome = test.outcome;
        const auto response = service.post(kSettings, R"({"priority1": 60})", kWrite);
        EXPECT_EQ(response.status, test.status);
        EXPECT_EQ(json::parse(response.body), test.expected);
    }
}

TEST(ServeApi, ServesMetricsInThePrometheusTextFormat) {
    FakeService service;
    service.state.counters().countFailure(kxQvFailureKind::noAnswer);
    service.state.counters().countResponse(200);
    const std::string text = service.get("/metrics").body;
    const std::string labels =
        R"({item="02-11-22-FF-FE-33-44-55:1",clock_identity="02-11-22-FF-FE-33-44-55",domain="0"})";
    for (const std::string& line : std::vector<std::string>{
             "# TYPE ptp_offset_from_master_seconds gauge\n",
             "ptp_offset_from_master_seconds" + labels + " -1.2e-08\n",
             "ptp_port_state" + labels + " 6\n",
             "ptp_grandmaster_info" + labels.substr(0, labels.size() - 1) +
                 R"(,grandmaster_identity="02-11-22-FF-FE-33-44-55"} 1)" + "\n",
             "ptp_last_read_success" + labels + " 1\n",
             "corbel_discovery_duration_seconds 1.25\n",
             "corbel_clocks 1\n",
             "corbel_exchanges_failed_total{reason=\"no_answer\"} 1\n",
             "# TYPE corbel_http_requests_total counter\ncorbel_http_requests_total{code=\"200\"} "
             "1\n",
         }) {
        EXPECT_NE(text.find(line), std::string::npos) << line << "\n" << text;
    }
    // The vanished clock's old offset does not pass for a current one.
    EXPECT_EQ(text.find("9.9e-08"), std::string::npos);
}

}  // namespace

TEST(ServeStart, RefusesWhatCannotBeServedSafelyBeforeLoadingTheExpert) {
    ::unsetenv("CORBEL_SERVE_TOKEN");
    const struct {
        std::string listen, tokenFile;
        bool readOnly;
        corbel::ExitCode code;
    } cases[] = {
        {"10.0.0.1:8588", "", false, corbel::ExitCode::kBadUsage},  // not loopback, no token
        {"0.0.0.0:8588", "", false, corbel::ExitCode::kBadUsage},
        {"127.0.0.1", "", false, corbel::ExitCode::kBadUsage},
        {"[::1:8588", "", false, corbel::ExitCode::kBadUsage},
        {"127.0.0.1:65536", "", false, corbel::ExitCode::kBadUsage},
        {"127.0.0.1:8588", "/nonexistent/token", false, corbel::ExitCode::kBadUsage},
        // Past the checks, it opens the expert, which fails here.
        {"10.0.0.1:8588", "", true, corbel::ExitCode::kNoExpert},
        {"[::1]:8588", "", false, corbel::ExitCode::kNoExpert},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.listen + " " + test.tokenFile);
        corbel::ServeOptions options;
        options.listen = test.listen;
        options.tokenFile = test.tokenFile;
        options.readOnly = test.readOnly;
        EXPECT_EQ(corbel::runServe(options,
                                   [](corbel::ExitCode& failed) {
                                       failed = corbel::ExitCode::kNoExpert;
                                       return nullptr;
                                   }),
                  test.code);
    }
}
