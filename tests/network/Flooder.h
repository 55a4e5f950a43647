#ifndef QV_TESTS_NETWORK_FLOODER_H
#define QV_TESTS_NETWORK_FLOODER_H

#include <cstdint>
#include <string>

namespace qvtest {

// Hostile traffic from a network namespace of its own: datagrams that no PTP port should
// accept, sent in turn to the PTP group and to `address`, on ports 319 and 320. They cycle
// through oversized ones (1025 octets up to `largest`), management messages cut short
// inside their header, garbage and empty ones (those to `address` only).
struct FloodPlan {
    std::string nameSpace;
    std::string address;
    long count = 0;
    long perSecond = 0;  // 0: as fast as the socket takes them
    std::size_t largest = 61000;
};

// Sends the plan on the calling thread; answers how many went out, or -1 with `failure`.
long flood(const FloodPlan& plan, std::string& failure);

}  // namespace qvtest

#endif
