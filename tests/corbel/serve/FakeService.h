#ifndef QV_TESTS_CORBEL_SERVE_FAKESERVICE_H
#define QV_TESTS_CORBEL_SERVE_FAKESERVICE_H

#include <string>
#include <vector>

#include "corbel/serve/Api.h"

namespace qvtest {

inline const std::string kPtp4lItem = "02-11-22-FF-FE-33-44-55:1";
inline const std::string kGoneItem = "02-11-22-FF-FE-33-44-66:1";

// A writer that answers what a test sets and remembers what it was asked.
class FakeWriter final : public corbel::SettingsWriter {
  public:
    corbel::WriteOutcome write(const std::string& item,
                               std::vector<corbel::Setting> settings) override {
        calls.push_back(item);
        asked = std::move(settings);
        return outcome;
    }
    corbel::WriteOutcome outcome;
    std::vector<std::string> calls;
    std::vector<corbel::Setting> asked;
};

// The state that a poller would have published after reading a ptp4l clock (MASTER in
// domain 0, TIME not supported, two samples of history) and a clock that vanished, with
// one event; and an Api over it on 127.0.0.1:8588 with the token "secret" and the
// allowed host "ptp.example".
struct FakeService {
    explicit FakeService(bool discovered = true, bool readOnly = false);

    // `target`: a path with an optional "?name=value".
    corbel::HttpResponse request(const std::string& method, const std::string& target,
                                 std::vector<std::pair<std::string, std::string>> headers,
                                 const std::string& body);
    corbel::HttpResponse get(const std::string& target, const std::string& host = "127.0.0.1:8588");
    corbel::HttpResponse post(const std::string& target, const std::string& body,
                              std::vector<std::pair<std::string, std::string>> headers);

    corbel::ServiceState state;
    FakeWriter writer;
    corbel::AccessToken token{"secret", corbel::AccessToken::Source::file};
    corbel::Api api;
};

}  // namespace qvtest

#endif
