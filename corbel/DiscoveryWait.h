#ifndef QV_CORBEL_DISCOVERYWAIT_H
#define QV_CORBEL_DISCOVERYWAIT_H

#include <cstdint>
#include <filesystem>
#include <optional>

namespace corbel {

// How long a discovery waits for answers. The expert reads it when it is initialised from
// the settings store: the file <root>/Software/Quarvel/Corbel/qv-1588/findClocksTimeout,
// milliseconds as text, root $QV_SETTINGS_ROOT or /etc/corbel. A wait chosen for one run
// is written into a store of its own that lives as long as this object.
class DiscoveryWait {
  public:
    explicit DiscoveryWait(std::optional<std::uint32_t> milliseconds);
    ~DiscoveryWait();
    DiscoveryWait(const DiscoveryWait&) = delete;
    DiscoveryWait& operator=(const DiscoveryWait&) = delete;

    // Tells a user at a terminal what the coming pause is (nothing when standard error is
    // not a terminal, so that scripts see only results).
    void announce(const char* purpose) const;

  private:
    std::uint16_t effectiveMilliseconds() const;

    std::optional<std::uint32_t> milliseconds_;
    std::filesystem::path ownRoot_;
};

}  // namespace corbel

#endif
