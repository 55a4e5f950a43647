#include "tests/support/ptp/InMemoryManagedClock.h"

using nQVPTP000::tClockIdentity;
using nQVPTP000::tPortIdentity;

namespace qvtest {

namespace {
constexpr std::uint8_t kIdentity[tClockIdentity::kSize] = {0x02, 0x00, 0x00, 0xFF,
                                                           0xFE, 0x00, 0x00, 0x01};
}

InMemoryManagedClock::InMemoryManagedClock(std::uint16_t numberPorts)
    : InMemoryManagedClock(numberPorts, tClockIdentity(kIdentity)) {}

InMemoryManagedClock::InMemoryManagedClock(std::uint16_t numberPorts,
                                           const tClockIdentity& identity)
    : ports(numberPorts) {
    defaultDataSet.clockIdentity = identity;
    parentDataSet.parentPortIdentity = tPortIdentity(identity, 0);
    parentDataSet.grandmasterIdentity = identity;
    for (std::uint16_t i = 0; i < numberPorts; ++i) {
        ports[i].portIdentity = tPortIdentity(identity, static_cast<std::uint16_t>(i + 1));
    }
}

bool InMemoryManagedClock::proceed(Kind kind, tStatus& status) const {
    const bool fail = (kind == Kind::getter && failures.getters) ||
                      (kind == Kind::setter && failures.setters) ||
                      (kind == Kind::command && failures.commands);
    if (fail && status.succeeded()) {
        status.set(kStatusBadContent, "inmemory", "InMemoryManagedClock", 0);
    }
    return status.succeeded();
}

InMemoryManagedClock::Port* InMemoryManagedClock::find(Kind kind, std::uint16_t port,
                                                       tStatus& status) {
    if (!proceed(kind, status)) {
        return nullptr;
    }
    if (port == 0 || port > ports.size()) {
        status.set(kStatusUnsupported, "inmemory", "InMemoryManagedClock", 0);
        return nullptr;
    }
    return &ports[port - 1U];
}

std::span<const std::uint8_t> InMemoryManagedClock::getPhysicalAddress(std::uint16_t port,
                                                                       tStatus& status) {
    const Port* found = find(Kind::getter, port, status);
    return found != nullptr ? std::span<const std::uint8_t>(found->physicalAddress)
                            : std::span<const std::uint8_t>();
}

void InMemoryManagedClock::enablePort(std::uint16_t port, tStatus& status) {
    writePort(port, &Port::enabled, true, status, Kind::command);
}
void InMemoryManagedClock::disablePort(std::uint16_t port, tStatus& status) {
    writePort(port, &Port::enabled, false, status, Kind::command);
}
void InMemoryManagedClock::initialize(std::uint16_t port, tStatus& status) {
    if (Port* found = find(Kind::command, port, status); found != nullptr) {
        ++found->initializations;
    }
}

}  // namespace qvtest
