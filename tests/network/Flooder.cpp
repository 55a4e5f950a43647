#include "tests/network/Flooder.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <thread>
#include <vector>

#include "tests/support/NetworkNamespaceEntry.h"

namespace qvtest {

namespace {

// A management message (messageType 13, version 2) whose messageLength promises 100 octets
// and whose datagram ends inside the 34-octet header.
std::vector<std::uint8_t> truncatedManagement() {
    std::vector<std::uint8_t> octets(20, 0);
    octets[0] = 0x0D;
    octets[1] = 0x02;
    octets[3] = 100;
    return octets;
}

std::vector<std::uint8_t> datagram(long n, std::size_t largest) {
    switch (n % 4) {
        case 0: {
            const std::size_t span = largest > 1025 ? largest - 1025 : 1;
            return std::vector<std::uint8_t>(1025 + static_cast<std::size_t>(n) * 7919 % span,
                                             0x0D);
        }
        case 1:
            return truncatedManagement();
        case 2:
            return std::vector<std::uint8_t>(static_cast<std::size_t>(40 + n % 200),
                                             static_cast<std::uint8_t>(n));
        default:
            return {};
    }
}

}  // namespace

long flood(const FloodPlan& plan, std::string& failure) {
    const NetworkNamespaceEntry entry(plan.nameSpace);
    const int fd = entry.entered() ? socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0) : -1;
    if (fd < 0) {
        failure = "cannot send from " + plan.nameSpace + ": " + entry.failure();
        return -1;
    }
    sockaddr_in targets[4] = {};
    for (int i = 0; i < 4; ++i) {
        targets[i].sin_family = AF_INET;
        targets[i].sin_port = htons(i % 2 == 0 ? 319 : 320);
        inet_pton(AF_INET, i < 2 ? "224.0.1.129" : plan.address.c_str(), &targets[i].sin_addr);
    }
    const auto started = std::chrono::steady_clock::now();
    long sent = 0;
    for (long n = 0; n < plan.count; ++n) {
        if (plan.perSecond > 0) {
            std::this_thread::sleep_until(started +
                                          std::chrono::microseconds(n * 1000000L / plan.perSecond));
        }
        const std::vector<std::uint8_t> octets = datagram(n, plan.largest);
        // An empty datagram goes to `address` only: ptp4l takes one on its own socket for a
        // fault of the port and stops answering.
        const sockaddr_in& to = targets[octets.empty() ? 2 + (n / 4) % 2 : (n / 4) % 4];
        sent += sendto(fd, octets.data(), octets.size(), 0, reinterpret_cast<const sockaddr*>(&to),
                       sizeof to) >= 0
                    ? 1
                    : 0;
    }
    close(fd);
    return sent;
}

}  // namespace qvtest
