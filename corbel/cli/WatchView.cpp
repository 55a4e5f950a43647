#include "corbel/cli/WatchView.h"

#include <cstdio>

#include "corbel/TagCatalog.h"
#include "corbel/ValueJson.h"
#include "corbel/ValueWords.h"
#include "corbel/cli/Table.h"

namespace corbel {

namespace {

bool answeredIn(const ItemReading& reading) {
    return reading.outcome(false) == ExitCode::kSuccess;
}

std::optional<PropertyValue> valueOf(const ItemReading& reading, kxSysAttributeTagID tag) {
    const auto found = reading.values.find(tag);
    return found == reading.values.end() ? std::nullopt : std::optional(found->second);
}

std::string textOf(const ItemReading& reading, kxSysAttributeTagID tag) {
    const auto value = valueOf(reading, tag);
    return value ? valueText(tag, *value) : "-";
}

// Why the clock gave no sample, in words.
std::string silenceOf(const ItemReading& reading) {
    if (reading.lookupFailure) {
        return reading.lookupFailure->words();
    }
    for (const auto& [tag, cause] : reading.unread) {
        if (!cause.notSupported()) {
            return cause.words();
        }
    }
    return {};
}

std::string joined(const std::vector<std::string>& words) {
    std::string text;
    for (const std::string& word : words) {
        text += (text.empty() ? "" : "; ") + word;
    }
    return text;
}

// key=value, the value quoted when it holds a space.
std::string pair(const std::string& key, const std::string& value) {
    return " " + key + "=" + (value.find(' ') == std::string::npos ? value : "\"" + value + "\"");
}

std::string domainText(const ClockPort& port) {
    return port.domain ? std::to_string(*port.domain) : "-";
}

}  // namespace

void WatchedClock::update(ItemReading reading) {
    changes = WatchView::changesBetween(last ? &*last : nullptr, reading);
    last = std::move(reading);
}

bool WatchedClock::answered() const {
    return last && answeredIn(*last);
}

const std::vector<kxSysAttributeTagID>& WatchView::tags() {
    static const std::vector<kxSysAttributeTagID> kTags = {
        kxQvPortState, kxQvOffsetFromMaster, kxQvMeanPathDelay, kxQvGrandmasterIdentity,
        kxQvStepsRemoved};
    return kTags;
}

std::vector<std::string> WatchView::changesBetween(const ItemReading* before,
                                                   const ItemReading& now) {
    if (before == nullptr) {
        return {"new clock"};
    }
    if (answeredIn(*before) != answeredIn(now)) {
        return {answeredIn(now) ? "answering again" : "stopped answering"};
    }
    std::vector<std::string> changes;
    for (const kxSysAttributeTagID tag :
         {kxQvPortState, kxQvGrandmasterIdentity, kxQvStepsRemoved}) {
        const std::string was = textOf(*before, tag);
        const std::string is = textOf(now, tag);
        if (was != is) {
            changes.push_back(tagName(tag) + " " + was + " → " + is);
        }
    }
    const auto offsetBefore = valueOf(*before, kxQvOffsetFromMaster);
    const auto offsetNow = valueOf(now, kxQvOffsetFromMaster);
    const double* was = offsetBefore ? std::get_if<double>(&*offsetBefore) : nullptr;
    const double* is = offsetNow ? std::get_if<double>(&*offsetNow) : nullptr;
    if (was != nullptr && is != nullptr && *was != *is) {
        char text[48];
        std::snprintf(text, sizeof text, "offset %+g ns", *is - *was);
        changes.emplace_back(text);
    }
    return changes;
}

std::string WatchView::screen(const std::vector<WatchedClock>& clocks, const std::string& heading) {
    Table table;
    table.add(
        {"ITEM", "DOMAIN", "PORT STATE", "OFFSET", "MEAN PATH DELAY", "GRANDMASTER", "CHANGES"});
    for (const WatchedClock& clock : clocks) {
        if (!clock.last) {
            continue;
        }
        const ItemReading& reading = *clock.last;
        const std::string silence = silenceOf(reading);
        if (!silence.empty()) {
            table.add({clock.port.item, domainText(clock.port), "(" + silence + ")", "", "", "",
                       joined(clock.changes)});
            continue;
        }
        table.add({clock.port.item, domainText(clock.port), textOf(reading, kxQvPortState),
                   textOf(reading, kxQvOffsetFromMaster), textOf(reading, kxQvMeanPathDelay),
                   textOf(reading, kxQvGrandmasterIdentity), joined(clock.changes)});
    }
    return heading + "\n\n" + table.render();
}

std::string WatchView::line(const WatchedClock& clock, const std::string& time) {
    const ItemReading& reading = *clock.last;
    std::string text = time + " " + clock.port.item + pair("domain", domainText(clock.port));
    if (const std::string silence = silenceOf(reading); !silence.empty()) {
        text += pair("error", silence);
    } else {
        for (const kxSysAttributeTagID tag : tags()) {
            text += pair(tagName(tag), textOf(reading, tag));
        }
    }
    return clock.changes.empty() ? text : text + pair("changes", joined(clock.changes));
}

nlohmann::ordered_json WatchView::json(const WatchedClock& clock, const std::string& time) {
    const ItemReading& reading = *clock.last;
    nlohmann::ordered_json sample = {
        {"time", time},
        {"item", clock.port.item},
        {"domain", clock.port.domain ? nlohmann::ordered_json(*clock.port.domain)
                                     : nlohmann::ordered_json(nullptr)},
        {"values", itemJson(reading)},
        {"changes", clock.changes}};
    if (const std::string silence = silenceOf(reading); !silence.empty()) {
        sample["error"] = silence;
    }
    return sample;
}

}  // namespace corbel
