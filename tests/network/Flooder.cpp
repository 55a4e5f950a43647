#include "tests/network/Flooder.h"

#include <arpa/inet.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <thread>
#include <vector>

#include "tests/support/NetworkNamespaceEntry.h"

namespace qvtest {

long flood(const std::string& nameSpace, const std::string& address, long count, long perSecond,
           std::size_t largest, std::string& failure) {
    const NetworkNamespaceEntry entry(nameSpace);
    const int fd = entry.entered() ? socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0) : -1;
    if (fd < 0) {
        failure = "cannot send from " + nameSpace + ": " + entry.failure();
        return -1;
    }
    // A management message whose messageLength promises 100 octets, cut inside its header.
    const std::vector<std::uint8_t> truncated = {0x0D, 0x02, 0x00, 100, 0, 0, 0, 0, 0, 0};
    const auto started = std::chrono::steady_clock::now();
    long sent = 0;
    for (long n = 0; n < count; ++n) {
        if (perSecond > 0) {
            std::this_thread::sleep_until(started +
                                          std::chrono::microseconds(n * 1000000L / perSecond));
        }
        const auto k = static_cast<std::size_t>(n);
        const std::size_t size = k % 4 == 0   ? 1025 + k * 7919 % (largest - 1025)
                                 : k % 4 == 2 ? 40 + k % 200
                                              : 0;
        const std::vector<std::uint8_t> octets =
            n % 4 == 1 ? truncated : std::vector<std::uint8_t>(size, static_cast<std::uint8_t>(n));
        // An empty datagram goes to `address` only: ptp4l takes one on its own socket for a
        // fault of the port and stops answering.
        const bool toGroup = (n / 4) % 2 == 0 && !octets.empty();
        sockaddr_in to{AF_INET, htons((n / 8) % 2 == 0 ? 319 : 320), {}, {}};
        inet_pton(AF_INET, toGroup ? "224.0.1.129" : address.c_str(), &to.sin_addr);
        sent += sendto(fd, octets.data(), octets.size(), 0, reinterpret_cast<const sockaddr*>(&to),
                       sizeof to) >= 0
                    ? 1
                    : 0;
    }
    close(fd);
    return sent;
}

}  // namespace qvtest
