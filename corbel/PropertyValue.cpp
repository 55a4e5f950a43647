#include "corbel/PropertyValue.h"

#include <charconv>
#include <cstdio>
#include <limits>
#include <type_traits>
#include <vector>

#include "corbel/ComPtr.h"
#include "corbel/UtcTime.h"
#include "corbel/WideText.h"

namespace corbel {

namespace {

std::vector<kxSysAttributeTagID> tagsOf(IkxSysPropertyBag& bag) {
    std::vector<kxSysAttributeTagID> tags;
    ComPtr<IkxSysEnumPropertyTag> enumerator;
    if (FAILED(bag.EnumerateTags(enumerator.out())) || !enumerator) {
        return tags;
    }
    kxSysAttributeTagID batch[32];
    ULONG fetched = 0;
    while (SUCCEEDED(enumerator->Next(32, batch, &fetched)) && fetched > 0) {
        tags.insert(tags.end(), batch, batch + fetched);
        fetched = 0;
    }
    return tags;
}

// `Out` is the getter's own type (LONG and ULONG are long on Windows), `Value` the variant's.
template <typename Value, typename Out = Value, typename Getter>
std::optional<PropertyValue> get(Getter getter) {
    Out value{};
    return SUCCEEDED(getter(&value)) ? std::optional<PropertyValue>(static_cast<Value>(value))
                                     : std::nullopt;
}

std::optional<PropertyValue> readTag(IkxSysPropertyBag& bag, IkxSysPropertyBag2* bag2,
                                     kxSysAttributeTagID tag) {
    ULONG type = 0;
    if (FAILED(bag.GetTagType(tag, &type))) {
        return std::nullopt;
    }
    switch (type) {
        case kxSysPropertyTypeBool: {
            BOOL flag = 0;
            return SUCCEEDED(bag.GetBool(tag, &flag)) ? std::optional<PropertyValue>(flag != 0)
                                                      : std::nullopt;
        }
        case kxSysPropertyTypeLong:
            return get<std::int32_t, LONG>([&](LONG* out) { return bag.GetLong(tag, out); });
        case kxSysPropertyTypeULong:
            return get<std::uint32_t, ULONG>([&](ULONG* out) { return bag.GetULong(tag, out); });
        case kxSysPropertyTypeDouble:
            return get<double>([&](double* out) { return bag.GetDouble(tag, out); });
        case kxSysPropertyTypeGUID:
            return get<GUID>([&](GUID* out) { return bag.GetGUID(tag, out); });
        case kxSysPropertyTypeString: {
            OwnedBstr text;
            return SUCCEEDED(bag.GetString(tag, text.out()))
                       ? std::optional<PropertyValue>(text.utf8())
                       : std::nullopt;
        }
        case kxSysPropertyTypeTimestamp:
            if (bag2 == nullptr) {
                return std::nullopt;
            }
            return get<kxSysAttrTimestampUTC>(
                [&](kxSysAttrTimestampUTC* out) { return bag2->GetTimestamp(tag, out); });
        default:
            return std::nullopt;
    }
}

template <typename Number>
ParsedValue parseNumber(std::string_view text) {
    Number number{};
    const char* end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, number);
    if (!text.empty() && parsed.ec == std::errc() && parsed.ptr == end) {
        return {number, {}};
    }
    if constexpr (std::is_floating_point_v<Number>) {
        return {std::nullopt, "takes a number such as 6 or 2.5"};
    } else {
        return {std::nullopt, "takes a whole number from " +
                                  std::to_string(std::numeric_limits<Number>::min()) + " to " +
                                  std::to_string(std::numeric_limits<Number>::max())};
    }
}

ParsedValue parseBool(std::string_view text) {
    if (text == "true" || text == "1") {
        return {true, {}};
    }
    if (text == "false" || text == "0") {
        return {false, {}};
    }
    return {std::nullopt, "takes true, false, 1 or 0"};
}

ParsedValue parseTime(std::string_view text) {
    const UtcParse parsed = parseUtc(text);
    switch (parsed.error) {
        case UtcError::kNone:
            return {*parsed.time, {}};
        case UtcError::kOutOfRange:
            return {std::nullopt, "takes a time from " + firstPtpTime() + " to " + lastPtpTime() +
                                      ", the times that PTP carries"};
        default:
            return {std::nullopt, "takes a UTC time such as 2026-12-06T20:15:00Z"};
    }
}

}  // namespace

PropertyValues readBag(IkxSysPropertyBag& bag) {
    // Timestamps are read through the second interface only.
    const auto bag2 = queryInterface<IkxSysPropertyBag2>(bag, IID_IkxSysPropertyBag2);
    PropertyValues values;
    for (const kxSysAttributeTagID tag : tagsOf(bag)) {
        if (auto value = readTag(bag, bag2.get(), tag)) {
            values.insert_or_assign(tag, std::move(*value));
        }
    }
    return values;
}

std::string guidText(const GUID& guid) {
    char text[40];
    std::snprintf(text, sizeof text, "{%08X-%04X-%04X-%02X%02X-%02X%02X%02X%02X%02X%02X}",
                  static_cast<unsigned>(guid.Data1), guid.Data2, guid.Data3, guid.Data4[0],
                  guid.Data4[1], guid.Data4[2], guid.Data4[3], guid.Data4[4], guid.Data4[5],
                  guid.Data4[6], guid.Data4[7]);
    return text;
}

ParsedValue parseValue(std::string_view text, kxSysPropertyType type) {
    switch (type) {
        case kxSysPropertyTypeBool:
            return parseBool(text);
        case kxSysPropertyTypeLong:
            return parseNumber<std::int32_t>(text);
        case kxSysPropertyTypeULong:
            return parseNumber<std::uint32_t>(text);
        case kxSysPropertyTypeDouble:
            return parseNumber<double>(text);
        case kxSysPropertyTypeString:
            return {std::string(text), {}};
        case kxSysPropertyTypeTimestamp:
            return parseTime(text);
        default:
            return {std::nullopt, "cannot be given as text"};
    }
}

HRESULT storeValue(IkxSysPropertyBag2& bag, kxSysAttributeTagID tag, const PropertyValue& value) {
    struct Store {
        IkxSysPropertyBag2& bag;
        kxSysAttributeTagID tag;
        HRESULT operator()(bool flag) const { return bag.SetBool(tag, flag ? 1 : 0); }
        HRESULT operator()(std::int32_t number) const { return bag.SetLong(tag, number); }
        HRESULT operator()(std::uint32_t number) const { return bag.SetULong(tag, number); }
        HRESULT operator()(double number) const { return bag.SetDouble(tag, number); }
        HRESULT operator()(const GUID& guid) const { return bag.SetGUID(tag, &guid); }
        HRESULT operator()(const std::string& text) const {
            return bag.SetString(tag, toUtf16(text).c_str());
        }
        HRESULT operator()(const kxSysAttrTimestampUTC& time) const {
            return bag.SetTimestamp(tag, &time);
        }
    };
    return std::visit(Store{bag, tag}, value);
}

}  // namespace corbel
