#include "tests/corbel/serve/FakeService.h"

namespace qvtest {

namespace {

using namespace corbel;

const WallTime kNoon{std::chrono::seconds(1796558400)};  // 2026-12-06T12:00:00Z

ClockStatus ptp4l() {
    ClockStatus clock{kPtp4lItem, "02-11-22-FF-FE-33-44-55",   true, kNoon, kNoon, true, {},
                      {},         std::make_shared<History>(3)};
    clock.values = {{kxQvDomainNumber, 0u},
                    {kxQvPortState, 6},
                    {kxQvPriority1, 100u},
                    {kxQvOffsetFromMaster, -12.0},
                    {kxQvGrandmasterIdentity, std::string("02-11-22-FF-FE-33-44-55")},
                    {kxQvUserDescription, std::string("alpha \"rack\"")},
                    {kxSysItemName, kPtp4lItem}};
    FailureCause notSupported = FailureCause::of(E_FAIL);
    notSupported.kind = kxQvFailureKind::refusedByClock;
    notSupported.managementErrorId = 6;  // NOT_SUPPORTED
    clock.unread[kxQvTime] = notSupported;
    clock.history->append({1796558399000, -10.0, 25.0, 6});
    clock.history->append({1796558400000, std::nullopt, std::nullopt, std::nullopt});
    return clock;
}

std::shared_ptr<const Snapshot> published() {
    auto snapshot = std::make_shared<Snapshot>();
    snapshot->discovery = DiscoveryStatus{kNoon, 1.25, 2};
    snapshot->clocks.push_back(ptp4l());
    ClockStatus gone{kGoneItem, "02-11-22-FF-FE-33-44-66",   false, kNoon, kNoon, false, {},
                     {},        std::make_shared<History>(3)};
    gone.values = {{kxQvDomainNumber, 1u}, {kxQvOffsetFromMaster, 99.0}};
    snapshot->clocks.push_back(gone);
    return snapshot;
}

}  // namespace

FakeService::FakeService(bool discovered, bool readOnly)
    : api(ServiceSettings{*ListenAddress::parse("127.0.0.1:8588"), readOnly, 1, 30, kNoon}, token,
          state, writer, {"ptp.example"}) {
    if (discovered) {
        state.publish(published());
        state.events().add({0, kNoon, kGoneItem, "vanished", "gone", {}});
    }
}

HttpResponse FakeService::request(const std::string& method, const std::string& target,
                                  std::vector<std::pair<std::string, std::string>> headers,
                                  const std::string& body) {
    const auto mark = target.find('?');
    HttpRequest request{method, target.substr(0, mark), {}, std::move(headers), body};
    if (mark != std::string::npos) {
        const std::string query = target.substr(mark + 1);
        request.query.emplace(query.substr(0, query.find('=')), query.substr(query.find('=') + 1));
    }
    return api.handle(request);
}

HttpResponse FakeService::get(const std::string& target, const std::string& host) {
    return request("GET", target, {{"Host", host}}, "");
}

HttpResponse FakeService::post(const std::string& target, const std::string& body,
                               std::vector<std::pair<std::string, std::string>> headers) {
    headers.emplace_back("Host", "127.0.0.1:8588");
    return request("POST", target, std::move(headers), body);
}

}  // namespace qvtest
