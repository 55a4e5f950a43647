#ifndef QV_CORBEL_READGROUPS_H
#define QV_CORBEL_READGROUPS_H

#include <qv1588/qv1588.h>

#include <vector>

namespace corbel {

// The tags that the expert reads from a clock with one request: asking for any of them
// reads them all, and a clock that refuses the request refuses them all.
struct ReadGroup {
    const char* name;
    std::vector<kxSysAttributeTagID> tags;  // the ones GetItemProperties takes
};

// In the order in which the expert asks the clock.
const std::vector<ReadGroup>& readGroups();

}  // namespace corbel

#endif
