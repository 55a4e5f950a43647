#include "corbel/serve/ApiJson.h"

#include "corbel/TagCatalog.h"
#include "corbel/ValueJson.h"

namespace corbel {

namespace {

// The values a listing of clocks shows for each.
constexpr kxSysAttributeTagID kKeyValues[] = {
    kxQvDomainNumber,     kxQvPortState,           kxQvPriority1,          kxQvPriority2,
    kxQvClockClass,       kxQvGrandmasterIdentity, kxQvParentPortIdentity, kxQvStepsRemoved,
    kxQvOffsetFromMaster, kxQvMeanPathDelay,       kxQvUserDescription,
};

void addValue(nlohmann::ordered_json& values, const ClockStatus& clock, kxSysAttributeTagID tag) {
    const TagInfo* info = findTag(tag);
    const std::string name = info != nullptr ? info->name : tagText(tag);
    if (const auto value = clock.values.find(tag); value != clock.values.end()) {
        values[name] = entryJson(tag, value->second);
    } else if (const auto unread = clock.unread.find(tag); unread != clock.unread.end()) {
        values[name] = unreadJson(tag, unread->second);
    }
}

template <typename T>
nlohmann::ordered_json orNull(const std::optional<T>& value) {
    return value ? nlohmann::ordered_json(*value) : nlohmann::ordered_json(nullptr);
}

nlohmann::ordered_json names(const std::vector<std::string>& list) {
    return list.empty() ? nlohmann::ordered_json::array() : nlohmann::ordered_json(list);
}

}  // namespace

nlohmann::ordered_json clockJson(const ClockStatus& clock, bool allValues) {
    nlohmann::ordered_json values = nlohmann::ordered_json::object();
    if (allValues) {
        std::map<kxSysAttributeTagID, int> tags;  // in tag order
        for (const auto& entry : clock.values) {
            tags[entry.first] = 0;
        }
        for (const auto& entry : clock.unread) {
            tags[entry.first] = 0;
        }
        for (const auto& entry : tags) {
            addValue(values, clock, entry.first);
        }
    } else {
        for (const kxSysAttributeTagID tag : kKeyValues) {
            addValue(values, clock, tag);
        }
    }
    return {{"item", clock.item},
            {"clockIdentity", clock.clockIdentity},
            {"domain", orNull(clock.domain())},
            {"present", clock.present},
            {"lastSeen", isoTime(clock.lastSeen)},
            {"lastRead", clock.lastRead ? nlohmann::ordered_json(isoTime(*clock.lastRead))
                                        : nlohmann::ordered_json(nullptr)},
            {"lastReadOk", clock.lastReadOk},
            {"values", std::move(values)}};
}

nlohmann::ordered_json historyJson(const ClockStatus& clock, long intervalSeconds) {
    nlohmann::ordered_json samples = nlohmann::ordered_json::array();
    if (clock.history) {
        for (const HistorySample& sample : clock.history->samples()) {
            const WallTime time{std::chrono::milliseconds(sample.unixMilliseconds)};
            samples.push_back({{"time", isoTime(time)},
                               {"t", sample.unixMilliseconds},
                               {"offsetFromMaster", orNull(sample.offsetFromMaster)},
                               {"meanPathDelay", orNull(sample.meanPathDelay)},
                               {"portState", orNull(sample.portState)}});
        }
    }
    return {{"item", clock.item}, {"interval", intervalSeconds}, {"samples", std::move(samples)}};
}

nlohmann::ordered_json eventJson(const Event& event) {
    return {{"id", event.id},     {"time", isoTime(event.time)}, {"item", event.item},
            {"kind", event.kind}, {"message", event.message},    {"detail", event.detail}};
}

nlohmann::ordered_json writeJson(const WriteOutcome& outcome) {
    if (outcome.result == WriteOutcome::Result::rejected) {
        return {{"sentences", outcome.sentences}};
    }
    nlohmann::ordered_json refused = nullptr;
    if (outcome.result == WriteOutcome::Result::refused) {
        refused = {
            {"name", outcome.refusedTag.empty() ? nlohmann::ordered_json(nullptr)
                                                : nlohmann::ordered_json(outcome.refusedTag)},
            {"reason", outcome.reason}};
    }
    return {{"written", names(outcome.written)},
            {"refused", std::move(refused)},
            {"notSent", names(outcome.notSent)}};
}

}  // namespace corbel
