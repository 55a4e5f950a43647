#include "corbel/serve/ServiceCounters.h"

namespace corbel {

void ServiceCounters::countFailure(kxQvFailureKind kind) {
    switch (kind) {
        case kxQvFailureKind::refusedByClock:
            ++failures_[0];
            break;
        case kxQvFailureKind::noAnswer:
            ++failures_[1];
            break;
        case kxQvFailureKind::network:
            ++failures_[2];
            break;
        default:
            ++failures_[3];
            break;
    }
}

void ServiceCounters::countResponse(int status) {
    if (status >= 0 && static_cast<std::size_t>(status) < responses_.size()) {
        ++responses_[static_cast<std::size_t>(status)];
    }
}

std::array<std::uint64_t, 4> ServiceCounters::failures() const {
    std::array<std::uint64_t, 4> counts{};
    for (std::size_t i = 0; i < counts.size(); ++i) {
        counts[i] = failures_[i].load();
    }
    return counts;
}

std::vector<std::pair<int, std::uint64_t>> ServiceCounters::responses() const {
    std::vector<std::pair<int, std::uint64_t>> counts;
    for (std::size_t status = 0; status < responses_.size(); ++status) {
        if (const std::uint64_t count = responses_[status].load(); count > 0) {
            counts.emplace_back(static_cast<int>(status), count);
        }
    }
    return counts;
}

}  // namespace corbel
