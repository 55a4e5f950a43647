// One discovery answered by many clock ports at once over real UDP on the private test
// network (root; run by tools/bench-client). Prints the ports found against those that
// answered, the time of the discovery (its 1000 ms wait included) and the client's peak
// memory (resident set high-water mark) before and after.
//
// Usage: qv_DiscoveryScaleBench [CLOCKS [PORTS]]   (250 clocks of 4 ports: 1000 ports)

#include <sys/resource.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "tests/bench/BurstResponder.h"
#include "tests/network/ManagementClient.h"
#include "tests/support/TestNetwork.h"

namespace {

long peakKilobytes() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

}  // namespace

int main(int argc, char** argv) {
    if (geteuid() != 0) {
        std::fprintf(stderr, "needs root (network namespaces)\n");
        return 2;
    }
    const auto clocks = static_cast<std::uint16_t>(argc > 1 ? std::atoi(argv[1]) : 250);
    const auto ports = static_cast<std::uint16_t>(argc > 2 ? std::atoi(argv[2]) : 4);
    qvtest::TestNetwork network({"none"});
    if (!network.isUp()) {
        std::fprintf(stderr, "test network did not come up: %s\n", network.failure().c_str());
        return 1;
    }
    qvtest::BurstResponder responder(network.clocks()[0].nameSpace, clocks, ports);
    std::string failure;
    if (!responder.start(failure)) {
        std::fprintf(stderr, "responder: %s\n", failure.c_str());
        return 1;
    }
    qvtest::ManagementClient client(network.clientNamespace());
    if (!client.isOpen()) {
        std::fprintf(stderr, "client: %s\n", client.failure().c_str());
        return 1;
    }
    const long before = peakKilobytes();
    tStatus status;
    const auto started = std::chrono::steady_clock::now();
    client.node().findClocks(1000, status);
    const auto took = std::chrono::steady_clock::now() - started;
    const long after = peakKilobytes();

    std::printf("Discovery of %u clocks x %u ports (domains 0 to 3, 1000 ms wait)\n", clocks,
                ports);
    std::printf("  found %u of %u ports (answers sent %llu), status %d\n",
                client.node().clockCount(), static_cast<unsigned>(clocks) * ports,
                static_cast<unsigned long long>(responder.answersSent()), status.code);
    std::printf("  discovery time %.1f ms\n",
                std::chrono::duration<double, std::milli>(took).count());
    std::printf("  peak memory (ru_maxrss) %ld KiB before, %ld KiB after (+%ld KiB)\n", before,
                after, after - before);
    return client.node().clockCount() == static_cast<unsigned>(clocks) * ports ? 0 : 1;
}
