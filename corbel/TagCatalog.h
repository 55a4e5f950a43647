#ifndef QV_CORBEL_TAGCATALOG_H
#define QV_CORBEL_TAGCATALOG_H

#include <qv1588/qv1588.h>

#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace corbel {

// What the command line knows of a tag is the expert's vocabulary in the public header.
using TagInfo = kxQvAttribute;

std::span<const TagInfo> allTags();

// Where a tag stands in the expert's table, which lists them by dataset: the order in
// which views list an item's tags. Unknown tags come last.
std::size_t catalogOrder(kxSysAttributeTagID tag);

// Every tag in ascending tag order: the order in which ApplyChanges writes them.
std::vector<const TagInfo*> tagsInOrder();

// The host's constant base properties (the item name, a flag and ten fixed values): they
// carry nothing about the clock, so views leave them out unless asked for all.
inline bool isBaseTag(const TagInfo& info) {
    return info.source == kxQvSource::constant;
}

// A tag's symbolic name, or its number when the expert does not know it.
std::string tagName(kxSysAttributeTagID tag);

// By symbolic name (any case) or by number ("0xE006000", any case, or decimal); null when
// the expert does not know it.
const TagInfo* findTag(std::string_view nameOrNumber);
const TagInfo* findTag(kxSysAttributeTagID tag);

// "0x" and seven upper-case hexadecimal digits: the key of a tag in JSON output.
std::string tagText(kxSysAttributeTagID tag);

// "bool", "i32", "u32", "double", "guid", "string", "timestamp".
const char* typeName(ULONG type);

}  // namespace corbel

#endif
