#include "corbel/serve/Snapshot.h"

#include <algorithm>

#include "corbel/TextCase.h"

namespace corbel {

std::optional<std::uint32_t> ClockStatus::domain() const {
    const auto* number = value<std::uint32_t>(kxQvDomainNumber);
    return number != nullptr ? std::optional<std::uint32_t>(*number) : std::nullopt;
}

const ClockStatus* Snapshot::find(std::string_view item) const {
    const auto found = std::ranges::find_if(
        clocks, [item](const ClockStatus& clock) { return sameIgnoringCase(clock.item, item); });
    return found == clocks.end() ? nullptr : &*found;
}

}  // namespace corbel
