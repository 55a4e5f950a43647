// corbel serve under load on the private test network (root; run by tools/bench-serve):
// 200 well-formed requests a second from four clients for SECONDS, a flood of malformed
// requests beside them, and the ptpd clock stopped (SIGSTOP) at a fifth of the run and
// continued (SIGCONT) at half of it. Prints the failed well-formed requests, their latency,
// the server's memory and open descriptors at the start and the end, and when the API
// reported the clock vanished and back. Fails when a well-formed request failed or the
// clock was not reported vanished and back.
//
// Usage: qv_ServeLoadBench [SECONDS [REDISCOVER]]   (300 s, rediscovery every 30 s)

#include <arpa/inet.h>
#include <httplib.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <mutex>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "tests/corbel/serve/ChildProcess.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/TestNetwork.h"

namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;
constexpr int kPort = 8588;
const std::string kPtpd = "02-11-22-FF-FE-33-44-77:1";

struct Load {
    std::mutex lock;
    std::vector<double> latencies;  // milliseconds; guarded by lock
    std::atomic<long> failed{0}, malformed{0}, malformedAnswered{0};
    std::atomic<bool> stop{false};
};

// One client: `perSecond` requests a second over one kept-alive connection, each path in
// turn, until told to stop.
void client(const std::string& nameSpace, int perSecond, Load& load) {
    qvtest::NetworkNamespaceEntry entry(nameSpace);
    httplib::Client http("127.0.0.1", kPort);
    http.set_keep_alive(true);
    const std::string paths[] = {"/api/v1/clocks",
                                 "/api/v1/clocks/" + kPtpd,
                                 "/metrics",
                                 "/api/v1/clocks/" + kPtpd + "/history",
                                 "/api/v1/events?since=0",
                                 "/api/v1/status"};
    auto next = Clock::now();
    for (std::size_t i = 0; !load.stop; ++i) {
        std::this_thread::sleep_until(next);
        next += std::chrono::microseconds(1000000 / perSecond);
        const auto sent = Clock::now();
        const auto result = http.Get(paths[i % std::size(paths)]);
        const std::chrono::duration<double, std::milli> took = Clock::now() - sent;
        if (!result || result->status != 200) {
            ++load.failed;
        }
        const std::lock_guard guard(load.lock);
        load.latencies.push_back(took.count());
    }
}

// Malformed requests, each on a connection of its own, about 50 a second.
void flood(const std::string& nameSpace, Load& load) {
    qvtest::NetworkNamespaceEntry entry(nameSpace);
    const std::string kinds[] = {
        "GARBAGE\r\n\r\n",
        "GET /api/v1/clocks HTTP/1.1\r\nHost: 127.0.0.1\r\nX: " + std::string(20000, 'a') +
            "\r\n\r\n",
        "GET /api/v1/clocks HTTP/1.1\r\nHost: evil.example\r\n\r\n",
        "POST /api/v1/clocks/" + kPtpd +
            "/settings HTTP/1.1\r\nHost: 127.0.0.1\r\nContent-Length: 99999\r\n\r\n",
        "GET /api/v1/clocks HTTP/1.1\r\nHost: 127.0.0.1\r\n",  // cut short: the peer closes
        "\x16\x03\x01\x02\x00\x01\x00\x01\xfc\x03\x03",
    };
    for (std::size_t i = 0; !load.stop; ++i) {
        std::this_thread::sleep_for(20ms);
        const int connection = ::socket(AF_INET, SOCK_STREAM, 0);
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_port = htons(kPort);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        const std::string& request = kinds[i % std::size(kinds)];
        if (::connect(connection, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0) {
            ::send(connection, request.data(), request.size(), MSG_NOSIGNAL);
            ::shutdown(connection, SHUT_WR);
            char answer[16] = {};
            timeval wait{1, 0};
            ::setsockopt(connection, SOL_SOCKET, SO_RCVTIMEO, &wait, sizeof wait);
            if (::recv(connection, answer, sizeof answer - 1, 0) > 0 &&
                std::string(answer).starts_with("HTTP/1.1 4")) {
                ++load.malformedAnswered;
            }
        }
        ::close(connection);
        ++load.malformed;
    }
}

struct Process {
    long rssKilobytes = 0;
    std::size_t descriptors = 0;
};

Process processOf(pid_t pid) {
    Process process;
    std::ifstream status("/proc/" + std::to_string(pid) + "/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmRSS:", 0) == 0) {
            process.rssKilobytes = std::atol(line.c_str() + 6);
        }
    }
    for ([[maybe_unused]] const auto& fd :
         std::filesystem::directory_iterator("/proc/" + std::to_string(pid) + "/fd")) {
        ++process.descriptors;
    }
    return process;
}

// Whether an event of `kind` for the ptpd clock came after `seen`, which moves on.
bool sawEvent(httplib::Client& http, const char* kind, std::uint64_t& seen) {
    const auto result = http.Get("/api/v1/events?since=" + std::to_string(seen));
    if (!result || result->status != 200) {
        return false;
    }
    const auto events = nlohmann::json::parse(result->body);
    seen = events["last"];
    for (const auto& event : events["events"]) {
        if (event["item"] == kPtpd && event["kind"] == kind) {
            return true;
        }
    }
    return false;
}

double percentile(std::vector<double>& values, double share) {
    std::ranges::sort(values);
    return values.empty()
               ? 0
               : values[std::min(
                     values.size() - 1,
                     static_cast<std::size_t>(share * static_cast<double>(values.size())))];
}

}  // namespace

int main(int argc, char** argv) {
    if (geteuid() != 0) {
        std::fprintf(stderr, "needs root (network namespaces)\n");
        return 2;
    }
    const int seconds = argc > 1 ? std::atoi(argv[1]) : 300;
    const std::string rediscover = argc > 2 ? argv[2] : "30";
    qvtest::TestNetwork network({"ptp4l:domain=0:mac=02:11:22:33:44:55",
                                 "ptp4l:domain=1:mac=02:11:22:33:44:66",
                                 "ptpd:domain=2:mac=02:11:22:33:44:77"});
    if (!network.isUp() || network.processIds().size() != 3) {
        std::fprintf(stderr, "test network did not come up: %s\n", network.failure().c_str());
        return 1;
    }
    const std::string log = "/tmp/qv-serve-bench-" + network.prefix() + ".log";
    qvtest::ChildProcess serve({"ip", "netns", "exec", network.clientNamespace(), QV_CORBEL_PROGRAM,
                                "--wait", "300", "serve", "--rediscover", rediscover},
                               log);
    qvtest::NetworkNamespaceEntry entry(network.clientNamespace());
    httplib::Client http("127.0.0.1", kPort);
    for (int i = 0;
         i < 100 && !(http.Get("/api/v1/clocks") && http.Get("/api/v1/clocks")->status == 200);
         ++i) {
        std::this_thread::sleep_for(100ms);
    }
    std::this_thread::sleep_for(3s);  // the first rounds of reads
    const Process atStart = processOf(serve.pid());
    Load load;
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back(client, network.clientNamespace(), 50, std::ref(load));
    }
    threads.emplace_back(flood, network.clientNamespace(), std::ref(load));
    const auto start = Clock::now();
    const auto at = [&start](double share, int total) {
        return start + std::chrono::milliseconds(static_cast<long>(share * total * 1000));
    };
    const pid_t ptpd = network.processIds()[2];
    std::optional<double> stopped, continued, vanished, back;
    std::uint64_t seen = 0;
    std::vector<long> rss;  // at each quarter of the run
    while (Clock::now() - start < std::chrono::seconds(seconds)) {
        std::this_thread::sleep_for(200ms);
        const double now = std::chrono::duration<double>(Clock::now() - start).count();
        if (!stopped && Clock::now() >= at(0.2, seconds)) {
            ::kill(ptpd, SIGSTOP);
            stopped = now;
        } else if (stopped && !continued && Clock::now() >= at(0.5, seconds)) {
            ::kill(ptpd, SIGCONT);
            continued = now;
        }
        if (rss.size() < 4 &&
            Clock::now() >= at(0.25 * static_cast<double>(rss.size() + 1), seconds)) {
            rss.push_back(processOf(serve.pid()).rssKilobytes);
        }
        if (stopped && !vanished && sawEvent(http, "vanished", seen)) {
            vanished = now;
        } else if (continued && !back && sawEvent(http, "appeared", seen)) {
            back = now;
        }
    }
    load.stop = true;
    for (std::thread& thread : threads) {
        thread.join();
    }
    if (stopped && !continued) {
        ::kill(ptpd, SIGCONT);
    }
    std::this_thread::sleep_for(1s);  // the server closes the clients' connections
    const Process atEnd = processOf(serve.pid());
    const int exitCode = serve.stop();
    std::vector<double> latencies = load.latencies;
    std::printf(
        "corbel serve under load (%d s, 4 clients at 50 requests/s, 3 clocks, rediscovery "
        "every %s s)\n",
        seconds, rediscover.c_str());
    std::printf(
        "  well-formed requests: %zu, failed %ld; latency p50 %.2f ms, p99 %.2f ms, max %.2f ms\n",
        latencies.size(), load.failed.load(), percentile(latencies, 0.5),
        percentile(latencies, 0.99), percentile(latencies, 1.0));
    std::printf("  malformed requests: %ld, answered with a 4xx %ld (the rest closed unanswered)\n",
                load.malformed.load(), load.malformedAnswered.load());
    const auto when = [](const std::optional<double>& time) { return time ? *time : -1.0; };
    std::printf(
        "  ptpd stopped at %.1f s, reported vanished at %.1f s; continued at %.1f s, "
        "reported back at %.1f s\n",
        when(stopped), when(vanished), when(continued), when(back));
    std::printf("  server: RSS %ld KiB at the start, at each quarter:", atStart.rssKilobytes);
    for (const long kilobytes : rss) {
        std::printf(" %ld", kilobytes);
    }
    std::printf(
        " KiB, %ld KiB at the end; open descriptors %zu at the start, %zu at the end; "
        "exit code %d after SIGTERM\n",
        atEnd.rssKilobytes, atStart.descriptors, atEnd.descriptors, exitCode);
    std::filesystem::remove(log);
    return load.failed == 0 && vanished && back && exitCode == 0 ? 0 : 1;
}
