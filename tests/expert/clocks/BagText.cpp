#include "tests/expert/clocks/BagText.h"

#include <cstdio>

namespace qvtest {

std::string textOf(IkxSysPropertyBag& bag, kxSysAttributeTagID tag) {
    ULONG type = 0;
    if (bag.GetTagType(tag, &type) != S_OK) {
        return "(none)";
    }
    BOOL flag = 0;
    LONG signedValue = 0;
    ULONG unsignedValue = 0;
    double real = 0;
    BSTR text = nullptr;
    kxSysAttrTimestampUTC time{};
    IkxSysPropertyBag2* second = nullptr;
    char number[64] = "";
    std::string narrow;
    switch (type) {
        case kxSysPropertyTypeBool:
            bag.GetBool(tag, &flag);
            return std::to_string(flag);
        case kxSysPropertyTypeLong:
            bag.GetLong(tag, &signedValue);
            return std::to_string(signedValue);
        case kxSysPropertyTypeULong:
            bag.GetULong(tag, &unsignedValue);
            return std::to_string(unsignedValue);
        case kxSysPropertyTypeDouble:
            bag.GetDouble(tag, &real);
            std::snprintf(number, sizeof number, "%.1f", real);
            return number;
        case kxSysPropertyTypeString:
            bag.GetString(tag, &text);
            for (const OLECHAR* unit = text; unit != nullptr && *unit != 0; ++unit) {
                narrow.push_back(*unit < 0x80 ? static_cast<char>(*unit) : '?');
            }
            SysFreeString(text);
            return narrow;
        case kxSysPropertyTypeTimestamp:
            bag.QueryInterface(IID_IkxSysPropertyBag2, reinterpret_cast<void**>(&second));
            second->GetTimestamp(tag, &time);
            second->Release();
            return std::to_string(time.seconds) + "+" + std::to_string(time.fraction);
        default:
            return "(type " + std::to_string(type) + ")";
    }
}

std::vector<kxSysAttributeTagID> readableTags() {
    std::vector<kxSysAttributeTagID> tags;
    for (const kxQvAttribute& row : kxQvAttributes) {
        if (row.requestable) {
            tags.push_back(row.tag);
        }
    }
    return tags;
}

}  // namespace qvtest
