#include "corbel/ValueJson.h"

#include "corbel/TagCatalog.h"
#include "corbel/UtcTime.h"
#include "corbel/ValueWords.h"

namespace corbel {

namespace {

nlohmann::ordered_json namesOf(const std::vector<kxSysAttributeTagID>& tags) {
    nlohmann::ordered_json names = nlohmann::ordered_json::array();
    for (const kxSysAttributeTagID tag : tags) {
        names.push_back(tagName(tag));
    }
    return names;
}

nlohmann::ordered_json causeJson(const FailureCause& cause) {
    nlohmann::ordered_json json = {{"error", cause.words()}};
    if (const std::string reason = cause.reason(); !reason.empty()) {
        json["reason"] = reason;
    }
    return json;
}

}  // namespace

nlohmann::ordered_json valueJson(const PropertyValue& value) {
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

nlohmann::ordered_json entryJson(kxSysAttributeTagID tag, const PropertyValue& value) {
    const TagInfo* info = findTag(tag);
    nlohmann::ordered_json entry = {
        {"tag", tagText(tag)}, {"type", typeName(typeOf(value))}, {"value", valueJson(value)}};
    const ValueWords words = wordsOf(tag, value);
    if (!words.word.empty()) {
        entry["word"] = words.word;
    }
    if (!words.unit.empty()) {
        entry["unit"] = words.unit;
    }
    entry["settable"] = info != nullptr && info->settable;
    return entry;
}

nlohmann::ordered_json unreadJson(kxSysAttributeTagID tag, const FailureCause& cause) {
    const TagInfo* info = findTag(tag);
    nlohmann::ordered_json entry = {
        {"tag", tagText(tag)},
        {"type", typeName(info != nullptr ? static_cast<ULONG>(info->type) : ULONG{0})},
        {"settable", info != nullptr && info->settable},
        {"value", nullptr}};
    entry.update(causeJson(cause));
    return entry;
}

nlohmann::ordered_json itemJson(const ItemReading& reading) {
    nlohmann::ordered_json item = nlohmann::ordered_json::object();
    for (const kxSysAttributeTagID tag : reading.tagsInOrder()) {
        const auto value = reading.values.find(tag);
        item[tagName(tag)] = value != reading.values.end()
                                 ? entryJson(tag, value->second)
                                 : unreadJson(tag, reading.unread.at(tag));
    }
    return item;
}

nlohmann::ordered_json changeJson(const std::string& item, const ChangeOutcome& outcome,
                                  const FailureCause& cause) {
    nlohmann::ordered_json refused = nullptr;
    if (outcome.failed) {
        refused = {{"name", tagName(*outcome.failed)}};
        refused.update(causeJson(cause));
    }
    return {{"item", item},
            {"written", namesOf(outcome.written)},
            {"refused", refused},
            {"notSent", namesOf(outcome.notSent)},
            {"unknown", namesOf(outcome.unknown)}};
}

}  // namespace corbel
