#include "corbel/TagCatalog.h"

#include <algorithm>
#include <charconv>
#include <cstdio>

namespace corbel {

namespace {

constexpr auto kBool = kxSysPropertyTypeBool;
constexpr auto kI32 = kxSysPropertyTypeLong;
constexpr auto kU32 = kxSysPropertyTypeULong;
constexpr auto kDouble = kxSysPropertyTypeDouble;
constexpr auto kString = kxSysPropertyTypeString;
constexpr auto kTime = kxSysPropertyTypeTimestamp;

// The host's general tags carry constants whose meaning is the host's; their names say
// only what the expert puts there.
constexpr TagInfo kTags[] = {
    {"hostFlag1001", 0x1001000, kBool, false},
    {"hostNumber1002", 0x1002000, kU32, false},
    {"hostText1004", 0x1004000, kString, false},
    {"hostText1006", 0x1006000, kString, false},
    {"hostText1007", 0x1007000, kString, false},
    {"manufacturerMatches", 0x1008000, kBool, false},
    {"hostNumber101C", 0x101C000, kI32, false},
    {"itemName", 0x101D000, kString, false},
    {"hostText1025", 0x1025000, kString, false},
    {"hostNumber102A", 0x102A000, kI32, false},
    {"hostNumber102B", 0x102B000, kI32, false},
    {"protocolAddress", 0x102C000, kString, false},
    {"physicalAddress", 0x1033000, kString, false},
    {"hostNumber1037", 0x1037000, kU32, false},
    {"portState", 0xE001000, kI32, false},
    {"productDescription", 0xE002000, kString, false},
    {"userDescription", 0xE003000, kString, true},
    {"profileIdentity", 0xE004000, kString, false},
    {"domainNumber", 0xE005000, kU32, true},
    {"priority1", 0xE006000, kU32, true},
    {"priority2", 0xE007000, kU32, true},
    {"slaveOnly", 0xE008000, kBool, true},
    {"twoStepFlag", 0xE009000, kBool, false},
    {"announceReceiptTimeout", 0xE00A000, kDouble, true},
    {"logAnnounceInterval", 0xE00B000, kI32, true},
    {"logSyncInterval", 0xE00C000, kI32, true},
    {"logMinPdelayReqInterval", 0xE00D000, kI32, true},
    {"stepsRemoved", 0xE00E000, kU32, false},
    {"offsetFromMaster", 0xE00F000, kDouble, false},
    {"meanPathDelay", 0xE010000, kDouble, false},
    {"parentPortIdentity", 0xE011000, kString, false},
    {"observedParentOffsetVariance", 0xE012000, kDouble, false},
    {"observedParentClockPhaseChangeRate", 0xE013000, kDouble, false},
    {"grandmasterIdentity", 0xE014000, kString, false},
    {"grandmasterPriority1", 0xE015000, kU32, false},
    {"grandmasterPriority2", 0xE016000, kU32, false},
    {"grandmasterClockClass", 0xE017000, kU32, false},
    {"grandmasterClockAccuracy", 0xE018000, kU32, false},
    {"parentReserved", 0xE019000, kDouble, false},
    {"clockAccuracy", 0xE01A000, kU32, false},
    {"clockClass", 0xE01B000, kU32, false},
    {"timeSource", 0xE01C000, kU32, false},
    {"currentUtcOffset", 0xE01D000, kU32, false},
    {"leap59", 0xE01E000, kBool, false},
    {"leap61", 0xE01F000, kBool, false},
    {"currentUtcOffsetValid", 0xE020000, kBool, false},
    {"ptpTimescale", 0xE021000, kBool, false},
    {"timeTraceable", 0xE022000, kBool, false},
    {"frequencyTraceable", 0xE023000, kBool, false},
    {"time", 0xE024000, kTime, true},
    {"expertItem", 0xE025000, kBool, false},
    {"expertItemName", 0xE026000, kString, false},
    {"portEnabled", 0xE027000, kBool, true},
    {"delayMechanism", 0xE028000, kU32, false},
};

bool sameIgnoringCase(std::string_view left, std::string_view right) {
    return std::ranges::equal(left, right, [](char a, char b) {
        return (a >= 'A' && a <= 'Z' ? a + 32 : a) == (b >= 'A' && b <= 'Z' ? b + 32 : b);
    });
}

}  // namespace

std::span<const TagInfo> allTags() {
    return kTags;
}

const TagInfo* findTag(kxSysAttributeTagID tag) {
    const auto found = std::ranges::find(kTags, tag, &TagInfo::tag);
    return found == std::end(kTags) ? nullptr : &*found;
}

const TagInfo* findTag(std::string_view nameOrNumber) {
    const auto byName = std::ranges::find_if(
        kTags, [&](const TagInfo& info) { return sameIgnoringCase(info.name, nameOrNumber); });
    if (byName != std::end(kTags)) {
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
