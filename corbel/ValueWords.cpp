#include "corbel/ValueWords.h"

#include <qv1588/qv1588.h>

#include <charconv>
#include <cmath>
#include <cstdio>
#include <optional>
#include <span>

#include "corbel/UtcTime.h"

namespace corbel {

namespace {

// A word for one value or a range of values.
struct Word {
    std::int64_t low, high;
    const char* text;
};

// IEEE 1588-2008 Table 8.
constexpr Word kPortStates[] = {
    {1, 1, "INITIALIZING"}, {2, 2, "FAULTY"},       {3, 3, "DISABLED"},
    {4, 4, "LISTENING"},    {5, 5, "PRE_MASTER"},   {6, 6, "MASTER"},
    {7, 7, "PASSIVE"},      {8, 8, "UNCALIBRATED"}, {9, 9, "SLAVE"},
};

// Table 7.
constexpr Word kTimeSources[] = {
    {0x10, 0x10, "ATOMIC_CLOCK"},
    {0x20, 0x20, "GPS"},
    {0x30, 0x30, "TERRESTRIAL_RADIO"},
    {0x40, 0x40, "PTP"},
    {0x50, 0x50, "NTP"},
    {0x60, 0x60, "HAND_SET"},
    {0x90, 0x90, "OTHER"},
    {0xA0, 0xA0, "INTERNAL_OSCILLATOR"},
};

// Table 9.
constexpr Word kDelayMechanisms[] = {{1, 1, "E2E"}, {2, 2, "P2P"}, {0xFE, 0xFE, "DISABLED"}};

// Table 6.
constexpr Word kClockAccuracies[] = {
    {0x20, 0x20, "within 25 ns"}, {0x21, 0x21, "within 100 ns"}, {0x22, 0x22, "within 250 ns"},
    {0x23, 0x23, "within 1 µs"},  {0x24, 0x24, "within 2.5 µs"}, {0x25, 0x25, "within 10 µs"},
    {0x26, 0x26, "within 25 µs"}, {0x27, 0x27, "within 100 µs"}, {0x28, 0x28, "within 250 µs"},
    {0x29, 0x29, "within 1 ms"},  {0x2A, 0x2A, "within 2.5 ms"}, {0x2B, 0x2B, "within 10 ms"},
    {0x2C, 0x2C, "within 25 ms"}, {0x2D, 0x2D, "within 100 ms"}, {0x2E, 0x2E, "within 250 ms"},
    {0x2F, 0x2F, "within 1 s"},   {0x30, 0x30, "within 10 s"},   {0x31, 0x31, "beyond 10 s"},
    {0xFE, 0xFE, "unknown"},
};

// Table 5; the reserved values have no word.
constexpr Word kClockClasses[] = {
    {6, 6, "primary reference"},
    {7, 7, "primary reference, holdover"},
    {13, 13, "application-specific"},
    {14, 14, "application-specific, holdover"},
    {52, 52, "primary reference, degraded (A)"},
    {58, 58, "application-specific, degraded (A)"},
    {68, 122, "alternate profile"},
    {133, 170, "alternate profile"},
    {187, 187, "primary reference, degraded (B)"},
    {193, 193, "application-specific, degraded (B)"},
    {216, 232, "alternate profile"},
    {248, 248, "default"},
    {255, 255, "slave-only"},
};

enum class Style {
    name,         // the word stands for the number
    numbered,     // the number, then its meaning
    hexNumbered,  // the number in hexadecimal as the standard writes it, then its meaning
    interval,     // log2 seconds, then the period
    quantity,     // the number and its unit
};

struct Presentation {
    kxSysAttributeTagID tag;
    Style style;
    std::span<const Word> words;
    const char* unit;
};

constexpr Presentation kPresentations[] = {
    {kxQvPortState, Style::name, kPortStates, ""},
    {kxQvTimeSource, Style::name, kTimeSources, ""},
    {kxQvDelayMechanism, Style::name, kDelayMechanisms, ""},
    {kxQvClockClass, Style::numbered, kClockClasses, ""},
    {kxQvGrandmasterClockClass, Style::numbered, kClockClasses, ""},
    {kxQvClockAccuracy, Style::hexNumbered, kClockAccuracies, ""},
    {kxQvGrandmasterClockAccuracy, Style::hexNumbered, kClockAccuracies, ""},
    {kxQvLogAnnounceInterval, Style::interval, {}, "log2 s"},
    {kxQvLogSyncInterval, Style::interval, {}, "log2 s"},
    {kxQvLogMinPdelayReqInterval, Style::interval, {}, "log2 s"},
    {kxQvOffsetFromMaster, Style::quantity, {}, "ns"},
    {kxQvMeanPathDelay, Style::quantity, {}, "ns"},
    {kxQvCurrentUtcOffset, Style::quantity, {}, "s"},
    {kxQvAnnounceReceiptTimeout, Style::quantity, {}, "announce intervals"},
};

const Presentation* presentationOf(kxSysAttributeTagID tag) {
    for (const Presentation& presentation : kPresentations) {
        if (presentation.tag == tag) {
            return &presentation;
        }
    }
    return nullptr;
}

std::optional<std::int64_t> integerOf(const PropertyValue& value) {
    if (const auto* number = std::get_if<std::int32_t>(&value)) {
        return *number;
    }
    if (const auto* number = std::get_if<std::uint32_t>(&value)) {
        return *number;
    }
    return std::nullopt;
}

std::string wordOf(std::span<const Word> words, std::optional<std::int64_t> number) {
    for (const Word& word : words) {
        if (number && *number >= word.low && *number <= word.high) {
            return word.text;
        }
    }
    return {};
}

std::string doubleText(double value) {
    char text[32];
    const auto end = std::to_chars(text, text + sizeof text, value).ptr;
    return std::string(text, end);
}

// The value alone: decimal numbers, true/false, text ("" when empty), ISO 8601 times.
std::string plainText(const PropertyValue& value) {
    struct Text {
        std::string operator()(bool flag) const { return flag ? "true" : "false"; }
        std::string operator()(std::int32_t number) const { return std::to_string(number); }
        std::string operator()(std::uint32_t number) const { return std::to_string(number); }
        std::string operator()(double number) const { return doubleText(number); }
        std::string operator()(const GUID& guid) const { return guidText(guid); }
        std::string operator()(const std::string& text) const {
            return text.empty() ? "\"\"" : text;
        }
        std::string operator()(const kxSysAttrTimestampUTC& time) const { return formatUtc(time); }
    };
    return std::visit(Text{}, value);
}

std::string hexText(std::int64_t number) {
    char text[24];
    std::snprintf(text, sizeof text, "0x%02llX", static_cast<unsigned long long>(number));
    return text;
}

}  // namespace

std::string periodText(int log2) {
    const double seconds = std::ldexp(1.0, log2);
    struct Scale {
        double factor;
        const char* unit;
    };
    static constexpr Scale kScales[] = {{1, "s"}, {1e3, "ms"}, {1e6, "µs"}, {1e9, "ns"}};
    for (const Scale& scale : kScales) {
        if (seconds * scale.factor >= 1 || scale.factor == 1e9) {
            char text[48];
            std::snprintf(text, sizeof text, "%.4g %s", seconds * scale.factor, scale.unit);
            return text;
        }
    }
    return {};
}

ValueWords wordsOf(kxSysAttributeTagID tag, const PropertyValue& value) {
    const Presentation* presentation = presentationOf(tag);
    if (presentation == nullptr) {
        return {};
    }
    const auto number = integerOf(value);
    if (presentation->style == Style::interval) {
        return {number ? periodText(static_cast<int>(*number)) : "", presentation->unit};
    }
    return {wordOf(presentation->words, number), presentation->unit};
}

std::string valueText(kxSysAttributeTagID tag, const PropertyValue& value) {
    const Presentation* presentation = presentationOf(tag);
    const std::string plain = plainText(value);
    if (presentation == nullptr) {
        return plain;
    }
    const ValueWords words = wordsOf(tag, value);
    const std::string meaning = words.word.empty() ? "" : " (" + words.word + ")";
    switch (presentation->style) {
        case Style::name:
            return words.word.empty() ? plain : words.word;
        case Style::hexNumbered: {
            const auto number = integerOf(value);
            return (number ? hexText(*number) : plain) + meaning;
        }
        case Style::quantity:
            return plain + " " + words.unit;
        default:
            return plain + meaning;
    }
}

}  // namespace corbel
