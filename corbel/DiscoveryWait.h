#ifndef QV_CORBEL_DISCOVERYWAIT_H
#define QV_CORBEL_DISCOVERYWAIT_H

#include <cstdint>
#include <optional>

namespace corbel {

// How long a discovery waits for answers. The expert reads it when it is initialised: the
// environment variable QV_FIND_CLOCKS_TIMEOUT, else the stored setting findClocksTimeout
// (qv::dsc::osdep::FindClocksTimeout). A wait chosen for one run sets that variable for
// this process only, so nothing shared is written and parallel runs do not meet.
class DiscoveryWait {
  public:
    explicit DiscoveryWait(std::optional<std::uint32_t> milliseconds);

    // Tells a user at a terminal what the coming pause is (nothing when standard error is
    // not a terminal, so that scripts see only results).
    void announce(const char* purpose) const;
};

}  // namespace corbel

#endif
