#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "corbel/ValueJson.h"
#include "corbel/ValueWords.h"

// What a user reads for a value: the IEEE 1588-2008 words (Tables 5 to 9), units and
// periods, and the JSON that carries the same beside the raw value.

namespace {

using corbel::PropertyValue;
using nlohmann::ordered_json;

TEST(ValueText, ShowsTheStandardsWordsUnitsAndPeriods) {
    const struct {
        kxSysAttributeTagID tag;
        PropertyValue value;
        const char* text;
        const char* word;
        const char* unit;
    } cases[] = {
        {kxQvPortState, std::int32_t{6}, "MASTER", "MASTER", ""},
        {kxQvPortState, std::int32_t{12}, "12", "", ""},  // no word: the number
        {kxQvTimeSource, std::uint32_t{0xA0}, "INTERNAL_OSCILLATOR", "INTERNAL_OSCILLATOR", ""},
        {kxQvDelayMechanism, std::uint32_t{2}, "P2P", "P2P", ""},
        {kxQvClockClass, std::uint32_t{248}, "248 (default)", "default", ""},
        {kxQvGrandmasterClockClass, std::uint32_t{100}, "100 (alternate profile)",
         "alternate profile", ""},
        {kxQvClockClass, std::uint32_t{200}, "200", "", ""},  // reserved
        {kxQvClockAccuracy, std::uint32_t{0x21}, "0x21 (within 100 ns)", "within 100 ns", ""},
        {kxQvGrandmasterClockAccuracy, std::uint32_t{0xFE}, "0xFE (unknown)", "unknown", ""},
        {kxQvOffsetFromMaster, -12.0, "-12 ns", "", "ns"},
        {kxQvLogSyncInterval, std::int32_t{-3}, "-3 (125 ms)", "125 ms", "log2 s"},
        {kxQvLogAnnounceInterval, std::int32_t{1}, "1 (2 s)", "2 s", "log2 s"},
        {kxQvLogMinPdelayReqInterval, std::int32_t{-10}, "-10 (976.6 µs)", "976.6 µs", "log2 s"},
        {kxQvCurrentUtcOffset, std::uint32_t{37}, "37 s", "", "s"},
        {kxQvUserDescription, std::string(), "\"\"", "", ""},
        {kxQvPriority1, std::uint32_t{100}, "100", "", ""},
        {kxQvTime, kxSysAttrTimestampUTC{0, 3879432900}, "2026-12-06T20:15:00Z", "", ""},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.text);
        EXPECT_EQ(corbel::valueText(test.tag, test.value), test.text);
        const auto words = corbel::wordsOf(test.tag, test.value);
        EXPECT_EQ(words.word, test.word);
        EXPECT_EQ(words.unit, test.unit);
    }
}

TEST(ValueJson, KeysByNameAndKeepsTheRawValueBesideItsWords) {
    corbel::ItemReading reading;
    reading.values = {{kxQvLogSyncInterval, std::int32_t{-1}},
                      {kxQvPortState, std::int32_t{9}},
                      {kxQvTime, kxSysAttrTimestampUTC{1ull << 63, 2082844800}}};
    corbel::FailureCause refused;
    refused.result = E_FAIL;
    refused.kind = kxQvFailureKind::refusedByClock;
    refused.managementErrorId = 6;
    reading.unread = {{kxQvLeap59, refused}};
    // Compared with the order of the keys: the order in which views list the tags.
    EXPECT_EQ(corbel::itemJson(reading), ordered_json::parse(R"({
        "portState": {"tag": "0xE001000", "type": "i32", "value": 9, "word": "SLAVE",
                      "settable": false},
        "logSyncInterval": {"tag": "0xE00C000", "type": "i32", "value": -1,
                            "word": "500 ms", "unit": "log2 s", "settable": true},
        "leap59": {"tag": "0xE01E000", "type": "bool", "settable": false, "value": null,
                   "error": "not supported by this clock", "reason": "NOT_SUPPORTED"},
        "time": {"tag": "0xE024000", "type": "timestamp", "value": "1970-01-01T00:00:00.5Z",
                 "settable": true}})"));

    refused.tag = kxQvPriority1;
    const auto outcome =
        corbel::ChangeOutcome::of({kxQvPriority2, kxQvUserDescription, kxQvPriority1}, refused);
    EXPECT_EQ(corbel::changeJson("X", outcome, refused), ordered_json::parse(R"({"item": "X",
        "written": ["userDescription"],
        "refused": {"name": "priority1", "error": "not supported by this clock",
                    "reason": "NOT_SUPPORTED"},
        "notSent": ["priority2"], "unknown": []})"));
}

}  // namespace
