#ifndef QV_CORBEL_SERVE_API_H
#define QV_CORBEL_SERVE_API_H

#include <string>
#include <vector>

#include "corbel/serve/AccessToken.h"
#include "corbel/serve/ClockSource.h"
#include "corbel/serve/HostRules.h"
#include "corbel/serve/HttpExchange.h"
#include "corbel/serve/ListenAddress.h"
#include "corbel/serve/ServiceState.h"
#include "corbel/serve/SettingsWriter.h"

namespace corbel {

// What the service was started with, as /api/v1/status tells it.
struct ServiceSettings {
    ListenAddress listen;
    bool readOnly = false;
    long interval = 1, rediscover = 30;
    WallTime started;
};

// Every route of `corbel serve`: the JSON API, /metrics and the explorer page, with the
// rules for every request (Host) and for writes (token, Origin, --read-only). It reads the
// published state and never the network; a write goes to the writer.
class Api {
  public:
    static constexpr std::size_t kMaxHeaders = 64;

    Api(ServiceSettings settings, const AccessToken& token, ServiceState& state,
        SettingsWriter& writer, const std::vector<std::string>& allowHosts);

    HttpResponse handle(const HttpRequest& request) const;

    // {"error": WORD, "message": TEXT} with the word of `status` ("not-found" for 404).
    static HttpResponse error(int status, const std::string& message);
    static const char* errorWord(int status);

  private:
    HttpResponse route(const HttpRequest& request, const std::vector<std::string>& segments) const;
    HttpResponse status() const;
    HttpResponse clocks() const;
    HttpResponse clock(const std::string& item, const std::string& part) const;
    HttpResponse events(const HttpRequest& request) const;
    HttpResponse write(const HttpRequest& request, const std::string& item) const;
    HttpResponse metrics() const;
    static HttpResponse asset(const std::string& name);
    static const ClockStatus* find(const Snapshot& snapshot, const std::string& item,
                                   HttpResponse& missing);

    const ServiceSettings settings_;
    const AccessToken& token_;
    ServiceState& state_;
    SettingsWriter& writer_;
    const HostRules hosts_;
};

}  // namespace corbel

#endif
