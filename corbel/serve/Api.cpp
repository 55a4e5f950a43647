#include "corbel/serve/Api.h"

#include <charconv>

#include "corbel/serve/ApiJson.h"
#include "corbel/serve/EmbeddedAssets.h"
#include "corbel/serve/MetricsText.h"
#include "corbel/serve/SettingsBody.h"

namespace corbel {

namespace {

constexpr const char* kJson = "application/json; charset=utf-8";

HttpResponse json(int status, const nlohmann::ordered_json& document) {
    // A clock's text that is not UTF-8 is shown with U+FFFD rather than failing the answer.
    return {status,
            kJson,
            document.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace),
            {{"Cache-Control", "no-store"}}};
}

std::vector<std::string> segmentsOf(const std::string& path) {
    std::vector<std::string> segments;
    std::size_t start = 1;
    while (start <= path.size()) {
        const std::size_t end = std::min(path.find('/', start), path.size());
        segments.push_back(path.substr(start, end - start));
        start = end + 1;
    }
    if (!segments.empty() && segments.back().empty()) {
        segments.pop_back();  // "/" and a trailing slash
    }
    return segments;
}

bool isRead(const std::string& method) {
    return method == "GET" || method == "HEAD";
}

const char* const kNotReady = "no discovery has finished yet; try again in a moment";

}  // namespace

Api::Api(ServiceSettings settings, const AccessToken& token, ServiceState& state,
         SettingsWriter& writer, const std::vector<std::string>& allowHosts)
    : settings_(std::move(settings)),
      token_(token),
      state_(state),
      writer_(writer),
      hosts_(settings_.listen, allowHosts) {}

const char* Api::errorWord(int status) {
    switch (status) {
        case 401:
            return "unauthorized";
        case 403:
            return "forbidden";
        case 404:
            return "not-found";
        case 405:
            return "method-not-allowed";
        case 413:
            return "too-large";
        case 422:
            return "rejected";
        case 502:
            return "refused";
        case 503:
            return "not-ready";
        default:
            return status >= 500 ? "internal-error" : "bad-request";
    }
}

HttpResponse Api::error(int status, const std::string& message) {
    return json(status, {{"error", errorWord(status)}, {"message", message}});
}

HttpResponse Api::handle(const HttpRequest& request) const {
    if (request.headers.size() > kMaxHeaders) {
        return error(400, "a request may carry at most 64 header fields");
    }
    if (!hosts_.allowsHost(request.header("Host"))) {
        return error(403, "the Host header names no address of this server (see --allow-host)");
    }
    return route(request, segmentsOf(request.path));
}

HttpResponse Api::route(const HttpRequest& request,
                        const std::vector<std::string>& segments) const {
    const auto only = [&request](const char* method, auto&& answer) {
        if (request.method == method ||
            (std::string_view(method) == "GET" && isRead(request.method))) {
            return answer();
        }
        HttpResponse refused = error(405, request.method + " is not allowed here, only " + method);
        refused.headers.emplace_back("Allow",
                                     std::string_view(method) == "GET" ? "GET, HEAD" : method);
        return refused;
    };
    const std::size_t count = segments.size();
    const bool api = count >= 3 && segments[0] == "api" && segments[1] == "v1";
    if (count == 0) {
        return only("GET", [] { return asset("index.html"); });
    }
    if (count == 2 && segments[0] == "assets") {
        return only("GET", [&] { return asset(segments[1]); });
    }
    if (count == 1 && segments[0] == "metrics") {
        return only("GET", [this] { return metrics(); });
    }
    if (api && count == 3 && segments[2] == "status") {
        return only("GET", [this] { return status(); });
    }
    if (api && count == 3 && segments[2] == "events") {
        return only("GET", [&] { return events(request); });
    }
    if (api && segments[2] == "clocks" && count == 3) {
        return only("GET", [this] { return clocks(); });
    }
    if (api && segments[2] == "clocks" &&
        (count == 4 || (count == 5 && segments[4] == "history"))) {
        return only("GET", [&] { return clock(segments[3], count == 5 ? segments[4] : ""); });
    }
    if (api && segments[2] == "clocks" && count == 5 && segments[4] == "settings") {
        return only("POST", [&] { return write(request, segments[3]); });
    }
    return error(404, "no such route: " + request.path);
}

HttpResponse Api::status() const {
    const auto snapshot = state_.snapshot();
    nlohmann::ordered_json discovery = nullptr;
    if (snapshot->discovery) {
        discovery = {{"time", isoTime(snapshot->discovery->time)},
                     {"durationSeconds", snapshot->discovery->durationSeconds},
                     {"clocks", snapshot->discovery->clocks}};
    }
    return json(200, {{"version", QV_VERSION},
                      {"listen", settings_.listen.text()},
                      {"writes", settings_.readOnly ? "read-only" : "token"},
                      {"interval", settings_.interval},
                      {"rediscover", settings_.rediscover},
                      {"discovery", std::move(discovery)},
                      {"started", isoTime(settings_.started)}});
}

HttpResponse Api::clocks() const {
    const auto snapshot = state_.snapshot();
    if (!snapshot->discovery) {
        return error(503, kNotReady);
    }
    nlohmann::ordered_json list = nlohmann::ordered_json::array();
    for (const ClockStatus& clock : snapshot->clocks) {
        list.push_back(clockJson(clock, false));
    }
    return json(200, {{"clocks", std::move(list)}});
}

// The clock of `item` in `snapshot`, or null with the answer that says why there is none.
const ClockStatus* Api::find(const Snapshot& snapshot, const std::string& item,
                             HttpResponse& missing) {
    const ClockStatus* clock = snapshot.discovery ? snapshot.find(item) : nullptr;
    if (clock == nullptr) {
        missing = snapshot.discovery ? error(404, "no clock port " + item) : error(503, kNotReady);
    }
    return clock;
}

HttpResponse Api::clock(const std::string& item, const std::string& part) const {
    const auto snapshot = state_.snapshot();
    HttpResponse missing;
    const ClockStatus* clock = find(*snapshot, item, missing);
    if (clock == nullptr) {
        return missing;
    }
    return json(200,
                part.empty() ? clockJson(*clock, true) : historyJson(*clock, settings_.interval));
}

HttpResponse Api::events(const HttpRequest& request) const {
    std::uint64_t since = 0;
    if (const auto given = request.query.find("since"); given != request.query.end()) {
        const std::string& text = given->second;
        const auto parsed = std::from_chars(text.data(), text.data() + text.size(), since);
        if (text.empty() || parsed.ec != std::errc() || parsed.ptr != text.data() + text.size()) {
            return error(400, "since takes the id of an event, a whole number from 0");
        }
    }
    std::uint64_t last = 0;
    nlohmann::ordered_json list = nlohmann::ordered_json::array();
    for (const Event& event : state_.events().after(since, last)) {
        list.push_back(eventJson(event));
    }
    return json(200, {{"events", std::move(list)}, {"last", last}});
}

HttpResponse Api::write(const HttpRequest& request, const std::string& item) const {
    if (settings_.readOnly) {
        return error(403, "writes are disabled: the server runs with --read-only");
    }
    if (const std::string origin = request.header("Origin");
        request.hasHeader("Origin") && !hosts_.allowsOrigin(origin)) {
        return error(403, "a write from another origin (" + origin + ") is refused");
    }
    if (!token_.matches(AccessToken::bearerOf(request.header("Authorization")))) {
        HttpResponse refused =
            error(401, "a write needs the header \"Authorization: Bearer TOKEN\"");
        refused.headers.emplace_back("WWW-Authenticate", "Bearer");
        return refused;
    }
    if (!request.header("Content-Type").starts_with("application/json")) {
        return error(400, "a write's body must be JSON (Content-Type: application/json)");
    }
    const SettingsBody body = SettingsBody::parse(request.body);
    if (!body.error.empty()) {
        return error(400, body.error);
    }
    const auto snapshot = state_.snapshot();
    HttpResponse missing;
    const ClockStatus* clock = find(*snapshot, item, missing);
    if (clock == nullptr) {
        return missing;
    }
    const WriteOutcome outcome = writer_.write(clock->item, body.settings);
    nlohmann::ordered_json answer = writeJson(outcome);
    switch (outcome.result) {
        case WriteOutcome::Result::written:
            return json(200, answer);
        case WriteOutcome::Result::rejected: {
            nlohmann::ordered_json rejected = {
                {"error", "rejected"}, {"message", "rejected by validation; nothing was sent"}};
            rejected.update(answer);
            return json(422, rejected);
        }
        default: {
            nlohmann::ordered_json refused = {
                {"error", "refused"},
                {"message", (outcome.refusedTag.empty() ? "the write" : outcome.refusedTag) +
                                " refused: " + outcome.reason}};
            refused.update(answer);
            return json(502, refused);
        }
    }
}

HttpResponse Api::metrics() const {
    return {200,
            "text/plain; version=0.0.4; charset=utf-8",
            metricsText(*state_.snapshot(), state_.counters()),
            {{"Cache-Control", "no-store"}}};
}

HttpResponse Api::asset(const std::string& name) {
    const EmbeddedAsset* found = findAsset(name);
    if (found == nullptr) {
        return error(404, "no such file: " + name);
    }
    return {200,
            assetContentType(name),
            std::string(found->bytes()),
            {{"Content-Security-Policy", "default-src 'self'"}, {"Cache-Control", "no-cache"}}};
}

}  // namespace corbel
