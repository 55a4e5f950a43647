#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <nlohmann/json.hpp>
#include <thread>

#include "corbel/serve/HttpServer.h"
#include "tests/corbel/serve/FakeService.h"

// corbel serve's HTTP side on loopback: what arrives on the socket, malformed or too big,
// gets a JSON error and leaves the server answering.

namespace {

// Sends `request` on a new connection and returns all that comes back until the server
// closes it.
std::string exchange(int port, const std::string& request) {
    const int connection = ::socket(AF_INET, SOCK_STREAM, 0);
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    std::string answer;
    if (::connect(connection, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0) {
        ::send(connection, request.data(), request.size(), MSG_NOSIGNAL);
        char buffer[4096];
        for (ssize_t count; (count = ::recv(connection, buffer, sizeof buffer, 0)) > 0;) {
            answer.append(buffer, static_cast<std::size_t>(count));
        }
    }
    ::close(connection);
    return answer;
}

std::string headers(int count, std::size_t length = 1) {
    std::string lines;
    for (int i = 0; i < count; ++i) {
        lines += "X-" + std::to_string(i) + ": " + std::string(length, 'a') + "\r\n";
    }
    return lines;
}

TEST(ServeHttp, AnswersMalformedAndOversizedRequestsWithJsonErrors) {
    qvtest::FakeService service;
    corbel::HttpServer server(service.api, service.state.counters());
    std::string failure;
    ASSERT_TRUE(server.bind("127.0.0.1", 0, failure)) << failure;
    std::thread serving([&server] { server.serve(); });
    const std::string host = "Host: 127.0.0.1\r\n";
    const std::string close = "Connection: close\r\n\r\n";
    const struct {
        std::string request;
        int status;
    } cases[] = {
        {"GARBAGE\r\n\r\n", 400},
        {"BREW /api/v1/status HTTP/1.1\r\n" + host + close, 400},
        {"GET /" + std::string(9000, 'a') + " HTTP/1.1\r\n" + host + "\r\n", 400},
        {"GET /api/v1/status HTTP/1.1\r\n" + host + "X: " + std::string(20000, 'a') + "\r\n\r\n",
         400},
        // Lines the library takes one by one, but 9 KiB together.
        {"GET /api/v1/status HTTP/1.1\r\n" + host + headers(45, 200) + close, 400},
        {"GET /api/v1/status HTTP/1.1\r\n" + host + headers(64) + "\r\n", 400},
        {"GET /api/v1/status HTTP/1.1\r\n" + host + headers(62) + close, 200},  // 64 in all
        {"POST /api/v1/clocks/" + qvtest::kPtp4lItem + "/settings HTTP/1.1\r\n" + host +
             "Content-Length: 20000\r\n\r\n" + std::string(20000, '{'),
         413},
        {"GET /api/v1/status HTTP/1.1\r\nHost: evil.example\r\n" + close, 403},
        {"GET /api/v1/status HTTP/1.1\r\n" + host + close, 200},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.request.substr(0, 40));
        const std::string answer = exchange(server.boundPort(), test.request);
        EXPECT_TRUE(answer.starts_with("HTTP/1.1 " + std::to_string(test.status))) << answer;
        const auto body =
            nlohmann::json::parse(answer.substr(answer.find("\r\n\r\n") + 4), nullptr, false);
        EXPECT_EQ(body.value("error", ""),
                  test.status == 200 ? "" : corbel::Api::errorWord(test.status));
    }
    server.stop();
    serving.join();
    const auto counted = service.state.counters().responses();
    EXPECT_EQ(counted,
              (std::vector<std::pair<int, std::uint64_t>>{{200, 2}, {400, 6}, {403, 1}, {413, 1}}));
}

}  // namespace
