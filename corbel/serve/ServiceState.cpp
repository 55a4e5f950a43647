#include "corbel/serve/ServiceState.h"

namespace corbel {

std::shared_ptr<const Snapshot> ServiceState::snapshot() const {
    const std::lock_guard guard(lock_);
    return snapshot_;
}

void ServiceState::publish(std::shared_ptr<const Snapshot> snapshot) {
    const std::lock_guard guard(lock_);
    // The old one goes with the argument, after the lock: freeing it takes time.
    snapshot_.swap(snapshot);
}

}  // namespace corbel
