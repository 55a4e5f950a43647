#include "corbel/ReadGroups.h"

#include <algorithm>

namespace corbel {

namespace {

constexpr kxSysAttributeTagID kTime[] = {0xE024000};
constexpr kxSysAttributeTagID kPort[] = {0xE027000, 0xE001000, 0xE00A000, 0xE00B000,
                                         0xE00C000, 0xE00D000, 0xE028000};
constexpr kxSysAttributeTagID kCurrent[] = {0xE00E000, 0xE00F000, 0xE010000};
constexpr kxSysAttributeTagID kDefault[] = {0xE005000, 0xE006000, 0xE007000, 0xE008000,
                                            0xE01A000, 0xE01B000, 0xE009000};
constexpr kxSysAttributeTagID kTimeProperties[] = {0xE01C000, 0xE021000, 0xE022000, 0xE023000};
constexpr kxSysAttributeTagID kParent[] = {0xE011000, 0xE012000, 0xE013000, 0xE014000, 0xE015000,
                                           0xE016000, 0xE017000, 0xE018000, 0xE019000};
constexpr kxSysAttributeTagID kUtc[] = {0xE01D000, 0xE01E000, 0xE01F000, 0xE020000};
constexpr kxSysAttributeTagID kClockDescription[] = {0x1033000, 0xE002000, 0xE003000, 0xE004000};

constexpr ReadGroup kGroups[] = {
    {"time", kTime},
    {"port data set", kPort},
    {"current data set", kCurrent},
    {"default data set", kDefault},
    {"time properties data set", kTimeProperties},
    {"parent data set", kParent},
    {"UTC properties", kUtc},
    {"clock description", kClockDescription},
};

}  // namespace

std::span<const ReadGroup> readGroups() {
    return kGroups;
}

const ReadGroup* groupOf(kxSysAttributeTagID tag) {
    const auto found = std::ranges::find_if(kGroups, [tag](const ReadGroup& group) {
        return std::ranges::find(group.tags, tag) != group.tags.end();
    });
    return found == std::end(kGroups) ? nullptr : &*found;
}

}  // namespace corbel
