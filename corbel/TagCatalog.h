#ifndef QV_CORBEL_TAGCATALOG_H
#define QV_CORBEL_TAGCATALOG_H

#include <qv1588/corbel.h>

#include <span>
#include <string>
#include <string_view>

namespace corbel {

// What the command line knows of an attribute tag.
struct TagInfo {
    const char* name;  // symbolic name, e.g. "priority1"
    kxSysAttributeTagID tag;
    kxSysPropertyType type;
    bool settable;
};

// Every tag the expert shows, in ascending tag order.
std::span<const TagInfo> allTags();

// By symbolic name or by number ("0xE006000", any case, or decimal); null when unknown.
const TagInfo* findTag(std::string_view nameOrNumber);
const TagInfo* findTag(kxSysAttributeTagID tag);

// "0x" and seven upper-case hexadecimal digits: the key of a tag in JSON output.
std::string tagText(kxSysAttributeTagID tag);

// "bool", "i32", "u32", "double", "guid", "string", "timestamp".
const char* typeName(ULONG type);

}  // namespace corbel

#endif
