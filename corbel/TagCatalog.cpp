#include "corbel/TagCatalog.h"

#include <algorithm>
#include <charconv>
#include <cstdio>

#include "corbel/TextCase.h"

namespace corbel {

std::span<const TagInfo> allTags() {
    return kxQvAttributes;
}

std::size_t catalogOrder(kxSysAttributeTagID tag) {
    const TagInfo* info = findTag(tag);
    return info != nullptr ? static_cast<std::size_t>(info - std::begin(kxQvAttributes))
                           : std::size(kxQvAttributes) + tag;
}

std::vector<const TagInfo*> tagsInOrder() {
    std::vector<const TagInfo*> tags;
    for (const TagInfo& info : kxQvAttributes) {
        tags.push_back(&info);
    }
    std::ranges::sort(tags, {}, &TagInfo::tag);
    return tags;
}

std::string tagName(kxSysAttributeTagID tag) {
    const TagInfo* info = findTag(tag);
    return info != nullptr ? info->name : tagText(tag);
}

const TagInfo* findTag(kxSysAttributeTagID tag) {
    return kxQvFindAttribute(tag);
}

const TagInfo* findTag(std::string_view nameOrNumber) {
    const auto byName = std::ranges::find_if(kxQvAttributes, [&](const TagInfo& info) {
        return sameIgnoringCase(info.name, nameOrNumber);
    });
    if (byName != std::end(kxQvAttributes)) {
        return &*byName;
    }
    int base = 10;
    if (nameOrNumber.size() > 2 && sameIgnoringCase(nameOrNumber.substr(0, 2), "0x")) {
        nameOrNumber.remove_prefix(2);
        base = 16;
    }
    kxSysAttributeTagID tag = 0;
    const auto* end = nameOrNumber.data() + nameOrNumber.size();
    const auto parsed = std::from_chars(nameOrNumber.data(), end, tag, base);
    if (nameOrNumber.empty() || parsed.ec != std::errc() || parsed.ptr != end) {
        return nullptr;
    }
    return findTag(tag);
}

std::string tagText(kxSysAttributeTagID tag) {
    char text[16];
    std::snprintf(text, sizeof text, "0x%07X", tag);
    return text;
}

const char* typeName(ULONG type) {
    static constexpr const char* kNames[] = {"?",      "bool", "i32",    "u32",
                                             "double", "guid", "string", "timestamp"};
    return type < std::size(kNames) ? kNames[type] : "?";
}

}  // namespace corbel
