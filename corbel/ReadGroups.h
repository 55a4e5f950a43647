#ifndef QV_CORBEL_READGROUPS_H
#define QV_CORBEL_READGROUPS_H

#include <qv1588/corbel.h>

#include <span>

namespace corbel {

// Tags that the expert reads from a clock with one request: asking for any of them reads
// them all, and a clock that refuses the request refuses them all.
struct ReadGroup {
    const char* name;
    std::span<const kxSysAttributeTagID> tags;
};

// In the order in which the expert serves them.
std::span<const ReadGroup> readGroups();

// The group a tag is read in; null for the tags that only the item's base bag carries.
const ReadGroup* groupOf(kxSysAttributeTagID tag);

}  // namespace corbel

#endif
