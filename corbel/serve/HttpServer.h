#ifndef QV_CORBEL_SERVE_HTTPSERVER_H
#define QV_CORBEL_SERVE_HTTPSERVER_H

#include <httplib.h>

#include <string>

#include "corbel/serve/Api.h"
#include "corbel/serve/ServiceCounters.h"

namespace corbel {

// The HTTP side of `corbel serve` on cpp-httplib: every request goes to the Api; what the
// library refuses by itself (a malformed request, a body over kMaxBody) is answered with
// the API's JSON error too. Each connection is served through a BoundedSocketStream by one
// of kWorkers threads.
class HttpServer final : public httplib::Server {
  public:
    static constexpr std::size_t kMaxBody = 16 * 1024;
    static constexpr std::size_t kWorkers = 8;
    static constexpr std::size_t kQueued = 64;
    static constexpr int kRequestsPerConnection = 100;

    HttpServer(const Api& api, ServiceCounters& counters);

    // Binds the address; false with `failure` set when it cannot. Port 0 takes a free one.
    bool bind(const std::string& host, int port, std::string& failure);
    int boundPort() const { return port_; }
    // Serves until stop() (from another thread).
    void serve() { listen_after_bind(); }

  private:
    bool process_and_close_socket(socket_t socket) override;

    const Api& api_;
    ServiceCounters& counters_;
    int port_ = 0;
};

}  // namespace corbel

#endif
