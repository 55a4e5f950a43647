#include "corbel/ReadGroups.h"

namespace corbel {

namespace {

// By kxQvSource.
constexpr const char* kGroupNames[kxQvClockSources] = {"time",
                                                       "port data set",
                                                       "current data set",
                                                       "default data set",
                                                       "time properties data set",
                                                       "parent data set",
                                                       "UTC properties",
                                                       "clock description"};

std::vector<ReadGroup> makeGroups() {
    std::vector<ReadGroup> groups;
    for (const char* name : kGroupNames) {
        groups.push_back({name, {}});
    }
    for (const kxQvAttribute& attribute : kxQvAttributes) {
        const auto source = static_cast<std::size_t>(attribute.source);
        if (attribute.requestable && source < kxQvClockSources) {
            groups[source].tags.push_back(attribute.tag);
        }
    }
    return groups;
}

}  // namespace

const std::vector<ReadGroup>& readGroups() {
    static const std::vector<ReadGroup> groups = makeGroups();
    return groups;
}

}  // namespace corbel
