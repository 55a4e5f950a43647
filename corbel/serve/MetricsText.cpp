#include "corbel/serve/MetricsText.h"

#include <charconv>
#include <functional>
#include <optional>

namespace corbel {

namespace {

// A label value with \, " and line ends escaped.
std::string escaped(const std::string& value) {
    std::string text;
    for (const char c : value) {
        text += c == '\\' ? "\\\\" : c == '"' ? "\\\"" : c == '\n' ? "\\n" : std::string(1, c);
    }
    return text;
}

std::string number(double value) {
    char text[32];
    const auto end = std::to_chars(text, text + sizeof text, value).ptr;
    return std::string(text, end);
}

std::string labelsOf(const ClockStatus& clock) {
    const auto domain = clock.domain();
    return "item=\"" + escaped(clock.item) + "\",clock_identity=\"" + escaped(clock.clockIdentity) +
           "\",domain=\"" + (domain ? std::to_string(*domain) : std::string()) + "\"";
}

void family(std::string& text, const char* name, const char* type, const char* help) {
    text += std::string("# HELP ") + name + " " + help + "\n# TYPE " + name + " " + type + "\n";
}

// A number that a present clock's last read gave, in the metric's unit.
using Reading = std::function<std::optional<double>(const ClockStatus&)>;

template <typename T>
Reading tagValue(kxSysAttributeTagID tag, double perUnit = 1.0) {
    return [tag, perUnit](const ClockStatus& clock) -> std::optional<double> {
        const T* value = clock.value<T>(tag);
        return value != nullptr ? std::optional<double>(static_cast<double>(*value) / perUnit)
                                : std::nullopt;
    };
}

struct ClockGauge {
    const char* name;
    const char* help;
    Reading reading;
};

void clockGauges(std::string& text, const Snapshot& snapshot) {
    const ClockGauge gauges[] = {
        {"ptp_offset_from_master_seconds", "Offset from master (currentDS.offsetFromMaster).",
         tagValue<double>(kxQvOffsetFromMaster, 1e9)},
        {"ptp_mean_path_delay_seconds", "Mean path delay (currentDS.meanPathDelay).",
         tagValue<double>(kxQvMeanPathDelay, 1e9)},
        {"ptp_port_state", "Port state, the IEEE 1588 number (6 MASTER, 9 SLAVE, ...).",
         tagValue<std::int32_t>(kxQvPortState)},
        {"ptp_steps_removed", "Steps removed from the grandmaster.",
         tagValue<std::uint32_t>(kxQvStepsRemoved)},
        {"ptp_clock_class", "Clock class of the clock's own quality.",
         tagValue<std::uint32_t>(kxQvClockClass)},
        {"ptp_priority1", "priority1 of the clock.", tagValue<std::uint32_t>(kxQvPriority1)},
        {"ptp_priority2", "priority2 of the clock.", tagValue<std::uint32_t>(kxQvPriority2)},
    };
    for (const ClockGauge& gauge : gauges) {
        family(text, gauge.name, "gauge", gauge.help);
        for (const ClockStatus& clock : snapshot.clocks) {
            const auto value = clock.present ? gauge.reading(clock) : std::nullopt;
            if (value) {
                text +=
                    std::string(gauge.name) + "{" + labelsOf(clock) + "} " + number(*value) + "\n";
            }
        }
    }
    family(text, "ptp_grandmaster_info", "gauge", "The grandmaster the clock follows.");
    for (const ClockStatus& clock : snapshot.clocks) {
        const auto* master = clock.value<std::string>(kxQvGrandmasterIdentity);
        if (clock.present && master != nullptr) {
            text += "ptp_grandmaster_info{" + labelsOf(clock) + ",grandmaster_identity=\"" +
                    escaped(*master) + "\"} 1\n";
        }
    }
    family(text, "ptp_last_read_success", "gauge",
           "1 when the last read of the clock had an answer for every group it asked.");
    for (const ClockStatus& clock : snapshot.clocks) {
        text += "ptp_last_read_success{" + labelsOf(clock) + "} " + (clock.lastReadOk ? "1" : "0") +
                "\n";
    }
}

void serviceMetrics(std::string& text, const Snapshot& snapshot, const ServiceCounters& counters) {
    family(text, "corbel_discovery_duration_seconds", "gauge",
           "How long the last discovery took, its wait for answers included.");
    if (snapshot.discovery) {
        text += "corbel_discovery_duration_seconds " + number(snapshot.discovery->durationSeconds) +
                "\n";
    }
    family(text, "corbel_poll_duration_seconds", "gauge",
           "How long the last round of reads of every clock took (writes served within it "
           "included).");
    if (snapshot.roundSeconds) {
        text += "corbel_poll_duration_seconds " + number(*snapshot.roundSeconds) + "\n";
    }
    std::size_t present = 0;
    for (const ClockStatus& clock : snapshot.clocks) {
        present += clock.present ? 1 : 0;
    }
    family(text, "corbel_clocks", "gauge", "Clock ports that answered their last read.");
    text += "corbel_clocks " + std::to_string(present) + "\n";
    family(text, "corbel_exchanges_failed_total", "counter",
           "Management exchanges with clocks that failed, by reason.");
    const auto failures = counters.failures();
    for (std::size_t i = 0; i < failures.size(); ++i) {
        text += std::string("corbel_exchanges_failed_total{reason=\"") +
                ServiceCounters::kReasons[i] + "\"} " + std::to_string(failures[i]) + "\n";
    }
    family(text, "corbel_http_requests_total", "counter", "HTTP requests answered, by status.");
    for (const auto& [status, count] : counters.responses()) {
        text += "corbel_http_requests_total{code=\"" + std::to_string(status) + "\"} " +
                std::to_string(count) + "\n";
    }
}

}  // namespace

std::string metricsText(const Snapshot& snapshot, const ServiceCounters& counters) {
    std::string text;
    clockGauges(text, snapshot);
    serviceMetrics(text, snapshot, counters);
    return text;
}

}  // namespace corbel
