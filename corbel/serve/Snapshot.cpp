#include "corbel/serve/Snapshot.h"

#include <algorithm>

namespace corbel {

namespace {

bool sameIgnoringCase(std::string_view left, std::string_view right) {
    return std::ranges::equal(left, right, [](char a, char b) {
        return (a >= 'a' && a <= 'z' ? a - 32 : a) == (b >= 'a' && b <= 'z' ? b - 32 : b);
    });
}

}  // namespace

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
