#ifndef QV_CORBEL_SERVE_LISTENADDRESS_H
#define QV_CORBEL_SERVE_LISTENADDRESS_H

#include <optional>
#include <string>
#include <string_view>

namespace corbel {

// Where the server listens: "127.0.0.1:8588", "0.0.0.0:80", "[::1]:8588".
struct ListenAddress {
    std::string host;  // as the socket takes it: "127.0.0.1", "::1"
    int port = 0;

    // Nothing when the text is not HOST:PORT with a port from 1 to 65535.
    static std::optional<ListenAddress> parse(std::string_view text);

    // 127.0.0.0/8, ::1 and "localhost".
    bool isLoopback() const;
    // The host as a Host header carries it: "127.0.0.1", "[::1]".
    std::string hostText() const;
    // "127.0.0.1:8588", "[::1]:8588".
    std::string text() const { return hostText() + ":" + std::to_string(port); }
};

}  // namespace corbel

#endif
