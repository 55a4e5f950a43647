// corbel serve's poller over many simulated clock ports answering over real UDP on the
// private test network (root; run by tools/bench-serve): the time of one round of reads of
// every port, the CPU share of the process and its memory, at a 1 s interval.
//
// Usage: qv_ServeScaleBench [CLOCKS [PORTS [SECONDS]]]   (250 clocks of 4 ports, 30 s)

#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

#include "corbel/ExpertSession.h"
#include "corbel/serve/ExpertClockSource.h"
#include "corbel/serve/Poller.h"
#include "tests/bench/BurstResponder.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/TestNetwork.h"

namespace {

using namespace std::chrono_literals;

// VmRSS or VmHWM of this process, KiB.
long statusKilobytes(const char* field) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(field, 0) == 0) {
            return std::atol(line.c_str() + std::string(field).size() + 1);
        }
    }
    return -1;
}

double cpuSeconds() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return static_cast<double>(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           static_cast<double>(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
}

}  // namespace

int main(int argc, char** argv) {
    if (geteuid() != 0) {
        std::fprintf(stderr, "needs root (network namespaces)\n");
        return 2;
    }
    const auto clocks = static_cast<std::uint16_t>(argc > 1 ? std::atoi(argv[1]) : 250);
    const auto ports = static_cast<std::uint16_t>(argc > 2 ? std::atoi(argv[2]) : 4);
    const int seconds = argc > 3 ? std::atoi(argv[3]) : 30;
    qvtest::TestNetwork network({"none"});
    if (!network.isUp()) {
        std::fprintf(stderr, "test network did not come up: %s\n", network.failure().c_str());
        return 1;
    }
    qvtest::BurstResponder responder(network.clocks()[0].nameSpace, clocks, ports, true);
    std::string failure;
    if (!responder.start(failure)) {
        std::fprintf(stderr, "responder: %s\n", failure.c_str());
        return 1;
    }
    const long before = statusKilobytes("VmRSS:");
    qvtest::NetworkNamespaceEntry entry(network.clientNamespace());
    corbel::ExpertSession session(QV_EXPERT_LIBRARY);
    if (!entry.entered() || !session.isReady() || !session.initialize()) {
        std::fprintf(stderr, "expert: %s %s\n", entry.failure().c_str(), session.failure().c_str());
        return 1;
    }
    corbel::ServiceState state;
    corbel::ExpertClockSource source(session.expert());
    corbel::Poller poller(source, state, {1s, 3600s});
    poller.start();
    // The first discovery and round, then the measured window.
    while (!state.snapshot()->roundSeconds) {
        std::this_thread::sleep_for(100ms);
    }
    const double cpuBefore = cpuSeconds() - responder.cpuSeconds();
    const auto start = std::chrono::steady_clock::now();
    std::vector<double> rounds;
    double last = -1;
    while (std::chrono::steady_clock::now() - start < std::chrono::seconds(seconds)) {
        std::this_thread::sleep_for(50ms);
        const auto snapshot = state.snapshot();
        if (*snapshot->roundSeconds != last) {  // a new round ended
            last = *snapshot->roundSeconds;
            rounds.push_back(last);
        }
    }
    const std::chrono::duration<double> wall = std::chrono::steady_clock::now() - start;
    const double cpu = cpuSeconds() - responder.cpuSeconds() - cpuBefore;
    const auto snapshot = state.snapshot();
    poller.stop();
    const auto present =
        std::ranges::count_if(snapshot->clocks, [](const auto& c) { return c.present; });
    std::ranges::sort(rounds);
    const double median = rounds.empty() ? 0 : rounds[rounds.size() / 2];
    std::printf("corbel serve's poller over %u clocks x %u ports (1 s interval, %d s)\n", clocks,
                ports, seconds);
    std::printf("  discovery found %zu ports in %.2f s; %ld answering at the end\n",
                snapshot->clocks.size(), snapshot->discovery->durationSeconds,
                static_cast<long>(present));
    std::printf(
        "  round of reads (6 GETs a port; TIME and UTC_PROPERTIES, refused once, are not "
        "asked again): median %.3f s, slowest %.3f s, %zu rounds\n",
        median, rounds.empty() ? 0 : rounds.back(), rounds.size());
    std::printf(
        "  CPU of the expert and the poller %.2f cores (%.1f s in %.1f s; the simulated "
        "clocks' thread not counted)\n",
        cpu / wall.count(), cpu, wall.count());
    std::printf("  memory: RSS %ld KiB before the expert, %ld KiB at the end, peak %ld KiB\n",
                before, statusKilobytes("VmRSS:"), statusKilobytes("VmHWM:"));
    return present == clocks * ports ? 0 : 1;
}
