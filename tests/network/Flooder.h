#ifndef QV_TESTS_NETWORK_FLOODER_H
#define QV_TESTS_NETWORK_FLOODER_H

#include <cstddef>
#include <string>

namespace qvtest {

// Hostile traffic from network namespace `nameSpace`, sent on the calling thread: `count`
// datagrams that no PTP port should accept, at most `perSecond` a second (0: as fast as the
// socket takes them), to the PTP group and to `address` in turn, on ports 319 and 320. They
// cycle through oversized ones (1025 octets up to `largest`), management messages cut short
// inside their header, garbage and empty ones (those to `address` only). Answers how many
// went out, or -1 with `failure`.
long flood(const std::string& nameSpace, const std::string& address, long count, long perSecond,
           std::size_t largest, std::string& failure);

}  // namespace qvtest

#endif
