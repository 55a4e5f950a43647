// How many bad datagrams a second the management client's receive loop absorbs. Needs root
// (network namespaces); run by tools/bench-client.
//
// A bare host on the private test network sends bad datagrams to the client (its address
// and the PTP group) as fast as its socket takes them; the receive loop's count of dropped
// datagrams, read before and after, gives the rate. Two runs of the flood's mix (oversized, truncated, garbage and
// empty datagrams): with oversized ones up to 61000 octets, and up to 1500.

#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <string>
#include <thread>

#include "tests/network/Flooder.h"
#include "tests/network/ManagementClient.h"
#include "tests/support/TestNetwork.h"

namespace {

using tSeconds = std::chrono::duration<double>;

void measure(const char* what, qvtest::ManagementClient& client, const std::string& host,
             const std::string& address, long count, std::size_t largest) {
    const auto& transceiver = client.node().getTransceiver();
    const std::uint64_t before = transceiver.badDatagramCount();
    const auto started = std::chrono::steady_clock::now();
    std::string failure;
    const long sent = qvtest::flood(host, address, count, 0, largest, failure);
    std::this_thread::sleep_for(std::chrono::milliseconds(200));  // let the loop drain
    const double seconds = tSeconds(std::chrono::steady_clock::now() - started).count();
    const std::uint64_t absorbed = transceiver.badDatagramCount() - before;
    std::printf("%-34s sent %7ld in %5.2f s, absorbed %7llu: %9.0f a second\n", what, sent, seconds,
                static_cast<unsigned long long>(absorbed), static_cast<double>(absorbed) / seconds);
}

}  // namespace

int main() {
    if (geteuid() != 0) {
        std::fprintf(stderr, "needs root (network namespaces)\n");
        return 2;
    }
    qvtest::TestNetwork network({"none"});
    if (!network.isUp()) {
        std::fprintf(stderr, "test network did not come up: %s\n", network.failure().c_str());
        return 1;
    }
    qvtest::ManagementClient client(network.clientNamespace());
    if (!client.isOpen()) {
        std::fprintf(stderr, "client did not open: %s\n", client.failure().c_str());
        return 1;
    }
    std::printf("Bad datagrams absorbed by the receive loop (sent as fast as possible)\n");
    const std::string host = network.clocks()[0].nameSpace;
    const std::string address = network.clientAddress();
    measure("mix, oversized up to 61000 octets", client, host, address, 100000, 61000);
    measure("mix, oversized up to 1500 octets", client, host, address, 200000, 1500);
    return 0;
}
