#include "corbel/serve/SettingsBody.h"

#include <cstdint>
#include <limits>
#include <nlohmann/json.hpp>
#include <optional>

#include "corbel/UtcTime.h"

namespace corbel {

namespace {

template <typename Number>
std::optional<PropertyValue> wholeNumber(const nlohmann::json& value) {
    if (value.is_number_unsigned()) {
        const auto number = value.get<std::uint64_t>();
        if (number <= static_cast<std::uint64_t>(std::numeric_limits<Number>::max())) {
            return static_cast<Number>(number);
        }
    } else if (value.is_number_integer()) {
        const auto number = value.get<std::int64_t>();
        if (number >= std::numeric_limits<Number>::min() &&
            number <= std::numeric_limits<Number>::max()) {
            return static_cast<Number>(number);
        }
    }
    return std::nullopt;
}

std::optional<PropertyValue> valueOf(const nlohmann::json& value, ULONG type) {
    switch (type) {
        case kxSysPropertyTypeBool:
            return value.is_boolean() ? std::optional<PropertyValue>(value.get<bool>())
                                      : std::nullopt;
        case kxSysPropertyTypeLong:
            return wholeNumber<std::int32_t>(value);
        case kxSysPropertyTypeULong:
            return wholeNumber<std::uint32_t>(value);
        case kxSysPropertyTypeDouble:
            return value.is_number() ? std::optional<PropertyValue>(value.get<double>())
                                     : std::nullopt;
        case kxSysPropertyTypeString:
            return value.is_string() ? std::optional<PropertyValue>(value.get<std::string>())
                                     : std::nullopt;
        case kxSysPropertyTypeTimestamp: {
            const auto time =
                value.is_string() ? parseUtc(value.get<std::string>()).time : std::nullopt;
            return time ? std::optional<PropertyValue>(*time) : std::nullopt;
        }
        default:
            return std::nullopt;
    }
}

const char* expected(ULONG type) {
    switch (type) {
        case kxSysPropertyTypeBool:
            return "true or false";
        case kxSysPropertyTypeLong:
            return "a whole number (32-bit)";
        case kxSysPropertyTypeULong:
            return "a whole number from 0 (32-bit)";
        case kxSysPropertyTypeDouble:
            return "a number";
        case kxSysPropertyTypeTimestamp:
            return "an ISO 8601 UTC time such as \"2026-12-06T20:15:00Z\"";
        default:
            return "a string";
    }
}

}  // namespace

SettingsBody SettingsBody::parse(std::string_view body) {
    SettingsBody result;
    const auto document = nlohmann::json::parse(body, nullptr, false);
    if (document.is_discarded() || !document.is_object() || document.empty()) {
        result.error = "the body must be a JSON object of settings, e.g. {\"priority1\": 100}";
        return result;
    }
    for (const auto& [name, value] : document.items()) {
        const TagInfo* tag = findTag(name);
        if (tag == nullptr || !tag->settable) {
            result.error = "'" + name + "' is not a setting that can be written";
            result.settings.clear();
            return result;
        }
        for (const Setting& setting : result.settings) {
            if (setting.tag == tag) {
                result.error = std::string(tag->name) + " is given twice";
                result.settings.clear();
                return result;
            }
        }
        auto parsed = valueOf(value, tag->type);
        if (!parsed) {
            result.error = std::string(tag->name) + " takes " + expected(tag->type);
            result.settings.clear();
            return result;
        }
        result.settings.push_back({tag, std::move(*parsed)});
    }
    return result;
}

}  // namespace corbel
