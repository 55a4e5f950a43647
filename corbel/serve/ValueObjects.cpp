#include "corbel/serve/ValueObjects.h"

#include "corbel/TagCatalog.h"
#include "corbel/UtcTime.h"

namespace corbel {

namespace {

nlohmann::ordered_json plainValue(const PropertyValue& value) {
    struct Json {
        nlohmann::ordered_json operator()(const GUID& guid) const { return guidText(guid); }
        nlohmann::ordered_json operator()(const kxSysAttrTimestampUTC& time) const {
            return formatUtc(time);
        }
        nlohmann::ordered_json operator()(bool flag) const { return flag; }
        nlohmann::ordered_json operator()(std::int32_t number) const { return number; }
        nlohmann::ordered_json operator()(std::uint32_t number) const { return number; }
        nlohmann::ordered_json operator()(double number) const { return number; }
        nlohmann::ordered_json operator()(const std::string& text) const { return text; }
    };
    return std::visit(Json{}, value);
}

// IEEE 1588-2008 Table 72, the management error ids that a clock answers with.
const char* managementErrorName(ULONG id) {
    switch (id) {
        case 0x0001:
            return "RESPONSE_TOO_BIG";
        case 0x0002:
            return "NO_SUCH_ID";
        case 0x0003:
            return "WRONG_LENGTH";
        case 0x0004:
            return "WRONG_VALUE";
        case 0x0005:
            return "NOT_SETABLE";
        case 0x0006:
            return "NOT_SUPPORTED";
        case 0xFFFE:
            return "GENERAL_ERROR";
        default:
            return "";
    }
}

}  // namespace

nlohmann::ordered_json valueObject(kxSysAttributeTagID tag, const PropertyValue& value) {
    const TagInfo* info = findTag(tag);
    return {{"tag", tagText(tag)},
            {"type", typeName(static_cast<ULONG>(value.index() + 1))},
            {"value", plainValue(value)},
            {"settable", info != nullptr && info->settable}};
}

nlohmann::ordered_json unreadObject(kxSysAttributeTagID tag, const ReadFailure& failure) {
    const TagInfo* info = findTag(tag);
    nlohmann::ordered_json entry = {{"tag", tagText(tag)},
                                    {"type", typeName(info != nullptr ? info->type : 0u)},
                                    {"settable", info != nullptr && info->settable},
                                    {"error", failureWords(failure)}};
    if (const char* name = managementErrorName(failure.managementErrorId); *name != '\0') {
        entry["reason"] = name;
    }
    return entry;
}

std::string portStateWord(std::int32_t state) {
    // IEEE 1588-2008 Table 8.
    static constexpr const char* kWords[] = {
        "",           "INITIALIZING", "FAULTY",  "DISABLED",     "LISTENING",
        "PRE_MASTER", "MASTER",       "PASSIVE", "UNCALIBRATED", "SLAVE"};
    return state >= 1 && state <= 9 ? kWords[state] : std::to_string(state);
}

std::string failureWords(const ReadFailure& failure) {
    switch (failure.kind) {
        case kxQvFailureKind::refusedByClock:
            return failure.notSupported() ? "not supported by this clock" : "refused by the clock";
        case kxQvFailureKind::noAnswer:
            return "no answer from the clock";
        case kxQvFailureKind::invalidValue:
            return "a value that validation rejects";
        case kxQvFailureKind::network:
            return "the network failed";
        default:
            return failure.words.empty() ? "failed" : failure.words;
    }
}

}  // namespace corbel
