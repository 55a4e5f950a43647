// Time of one management exchange against a real ptp4l on the private test network,
// compared with the time the clock itself takes to answer. Needs root (network
// namespaces); run by tools/bench-client.
//
// For each of GET PRIORITY1 and GET DEFAULT_DATA_SET: `kExchanges` exchanges through the
// clock proxy, each timed from the call to its return; meanwhile tcpdump records the
// client's bridge, and the clock's answer time of each exchange is the time from our
// request to the clock's answer on the wire. Prints the medians, their ratio and their
// difference (the client's own share of an exchange).
//
// Usage: qv_ExchangeTimeBench [EXCHANGES]   (200 by default; CI runs a few as a smoke test)

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/TestNetwork.h"

namespace {

using nQVPTPMGMT000::tPTPClockProxy;
using qvtest::ManagementClient;
using qvtest::TestNetwork;
using tSeconds = std::chrono::duration<double>;

constexpr int kDefaultExchanges = 200;
constexpr long kPcapHeaderOctets = 24;

long captureSize(const std::string& path) {
    struct stat info {};
    return stat(path.c_str(), &info) == 0 ? static_cast<long>(info.st_size) : 0;
}

double median(std::vector<double> values) {
    if (values.empty()) {
        return 0.0;
    }
    std::sort(values.begin(), values.end());
    const std::size_t middle = values.size() / 2;
    return values.size() % 2 == 1 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

// Request-to-answer times on the wire, in seconds, of the exchanges of one management id
// that the client sent (source port number 0x5151), from a capture.
std::vector<double> wireTimes(const std::string& capture, unsigned managementId) {
    const auto fields = qvtest::runCommand(
        "tshark -r " + capture + " -Y 'ptp.v2.mm.managementId == " + std::to_string(managementId) +
        "' -T fields -e frame.time_epoch -e ptp.v2.sequenceid -e ptp.v2.mm.action " +
        "-e ptp.v2.sourceportid -e ptp.v2.mm.targetportid 2>/dev/null");
    std::map<unsigned, double> requests;
    std::vector<double> times;
    std::istringstream lines(fields.output);
    std::string line;
    while (std::getline(lines, line)) {
        std::istringstream words(line);
        double when = 0;
        unsigned sequence = 0;
        unsigned action = 0;
        unsigned source = 0;
        unsigned target = 0;
        if (!(words >> when >> sequence >> action >> source >> target)) {
            continue;
        }
        if (action == 0 && source == ManagementClient::kPortNumber) {
            requests[sequence] = when;
        } else if (action == 2 && target == ManagementClient::kPortNumber &&
                   requests.count(sequence) != 0) {
            times.push_back(when - requests[sequence]);
            requests.erase(sequence);
        }
    }
    return times;
}

template <typename Get>
std::vector<double> timeExchanges(int exchanges, Get get, int& failures) {
    std::vector<double> times;
    for (int i = 0; i < exchanges; ++i) {
        tStatus status;
        const auto started = std::chrono::steady_clock::now();
        get(status);
        times.push_back(tSeconds(std::chrono::steady_clock::now() - started).count());
        failures += status.failed() ? 1 : 0;
    }
    return times;
}

void report(const char* what, const std::vector<double>& ours, const std::vector<double>& wire,
            int failures) {
    const double exchange = median(ours) * 1e6;
    const double answer = median(wire) * 1e6;
    std::printf("%-20s exchanges %zu (failed %d), answers on the wire %zu\n", what, ours.size(),
                failures, wire.size());
    std::printf("%-20s our exchange median %8.1f us, clock's answer median %8.1f us\n", "",
                exchange, answer);
    std::printf("%-20s ratio %.2f, our share %.1f us (goal: under 1000 us)\n", "",
                answer > 0 ? exchange / answer : 0.0, exchange - answer);
}

}  // namespace

int main(int argc, char** argv) {
    const int exchanges = argc > 1 ? std::atoi(argv[1]) : kDefaultExchanges;
    if (exchanges <= 0) {
        std::fprintf(stderr, "usage: qv_ExchangeTimeBench [EXCHANGES]\n");
        return 2;
    }
    if (geteuid() != 0) {
        std::fprintf(stderr, "needs root (network namespaces)\n");
        return 2;
    }
    TestNetwork network({"ptp4l:domain=0:desc=bench"});
    if (!network.isUp()) {
        std::fprintf(stderr, "test network did not come up: %s\n", network.failure().c_str());
        return 1;
    }
    ManagementClient client(network.clientNamespace());
    tStatus status;
    const auto proxies =
        client.isOpen() ? client.findClocks(500, status) : std::vector<tPTPClockProxy*>();
    if (proxies.size() != 1) {
        std::fprintf(stderr, "the clock was not found: %s\n", client.failure().c_str());
        return 1;
    }
    tPTPClockProxy& proxy = *proxies[0];

    char directory[] = "/tmp/qv-bench-XXXXXX";
    if (mkdtemp(directory) == nullptr) {
        return 1;
    }
    const std::string capture = std::string(directory) + "/exchanges.pcap";
    const auto pid = network.runInClient("tcpdump -i br0 -B 16384 --immediate-mode -U -w " +
                                         capture + " udp port 320 >" + std::string(directory) +
                                         "/tcpdump.log 2>&1 & echo $!");
    // tcpdump needs a moment before it records: ping the clock until the capture grows.
    for (int i = 0; i < 100 && captureSize(capture) <= kPcapHeaderOctets; ++i) {
        tStatus ping;
        proxy.getNullManagement(ping);
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
    }

    int priorityFailures = 0;
    const auto priority = timeExchanges(
        exchanges, [&](tStatus& s) { proxy.getPriority1(s); }, priorityFailures);
    int dataSetFailures = 0;
    const auto dataSet = timeExchanges(
        exchanges, [&](tStatus& s) { proxy.getDefaultDataSet(s); }, dataSetFailures);

    std::this_thread::sleep_for(std::chrono::milliseconds(500));
    qvtest::runCommand("kill -INT " + pid.output);
    std::this_thread::sleep_for(std::chrono::milliseconds(500));

    std::printf("Exchange time against ptp4l (%d exchanges each)\n", exchanges);
    report("GET PRIORITY1", priority, wireTimes(capture, 0x2005), priorityFailures);
    report("GET DEFAULT_DATA_SET", dataSet, wireTimes(capture, 0x2000), dataSetFailures);
    if (getenv("QV_BENCH_KEEP") == nullptr) {
        qvtest::runCommand(std::string("rm -rf ") + directory);
    } else {
        std::printf("capture kept: %s\n", capture.c_str());
    }
    // A failed exchange is a fault of the client, not a slow figure.
    return priorityFailures + dataSetFailures == 0 ? 0 : 1;
}
