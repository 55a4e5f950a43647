#include "tests/expert/clocks/BagText.h"

#include <cstdio>

namespace qvtest {

std::string textOf(IkxSysPropertyBag& bag, kxSysAttributeTagID tag) {
    ULONG type = 0;
    BOOL flag = 0;
    LONG number = 0;
    ULONG unsignedNumber = 0;
    double real = 0;
    BSTR text = nullptr;
    kxSysAttrTimestampUTC time{};
    IkxSysPropertyBag2* second = nullptr;
    char printed[64] = "(none)";
    std::string narrow;
    switch (bag.GetTagType(tag, &type) == S_OK ? type : 0) {
        case kxSysPropertyTypeBool:
            bag.GetBool(tag, &flag);
            return std::to_string(flag);
        case kxSysPropertyTypeLong:
            bag.GetLong(tag, &number);
            return std::to_string(number);
        case kxSysPropertyTypeULong:
            bag.GetULong(tag, &unsignedNumber);
            return std::to_string(unsignedNumber);
        case kxSysPropertyTypeDouble:
            bag.GetDouble(tag, &real);
            std::snprintf(printed, sizeof printed, "%.1f", real);
            break;
        case kxSysPropertyTypeString:
            bag.GetString(tag, &text);
            for (const OLECHAR* unit = text; unit != nullptr && *unit != 0; ++unit) {
                std::snprintf(printed, sizeof printed, "\\u%04X", static_cast<unsigned>(*unit));
                narrow += *unit < 0x80 ? std::string(1, static_cast<char>(*unit)) : printed;
            }
            SysFreeString(text);
            return narrow;
        case kxSysPropertyTypeTimestamp:
            bag.QueryInterface(IID_IkxSysPropertyBag2, reinterpret_cast<void**>(&second));
            second->GetTimestamp(tag, &time);
            second->Release();
            return std::to_string(time.seconds) + "+" + std::to_string(time.fraction);
    }
    return printed;
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
