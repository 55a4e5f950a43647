#include "corbel/cli/Watch.h"

#include <algorithm>
#include <cstdio>
#include <thread>

#include "corbel/UtcTime.h"
#include "corbel/cli/StopSignal.h"
#include "corbel/cli/Terminal.h"

namespace corbel {

namespace {

using Clock = std::chrono::steady_clock;

// Rediscovery: every ten samples, but not more often than every ten seconds.
constexpr int kSamplesPerDiscovery = 10;
constexpr std::chrono::seconds kShortestDiscoveryPeriod{10};

}  // namespace

Watch::Watch(const CommandContext& context, const Options& options)
    : context_(context), options_(options), live_(Terminal::isStandardOutput() && !options.json) {}

ExitCode Watch::start(const std::vector<std::string>& items) {
    ExitCode code = ExitCode::kSuccess;
    named_ = !items.empty();
    if (!named_) {
        for (ClockPort& port : context_.discover("watch", code)) {
            clocks_.push_back({std::move(port), std::nullopt, {}, false});
        }
        return clocks_.empty() ? code : ExitCode::kSuccess;
    }
    for (const std::string& item : items) {
        const ItemReading reading = context_.reader().read(item, {kxQvDomainNumber});
        if (reading.lookupFailure) {
            return context_.reportReading(reading, false);
        }
        const auto found = reading.values.find(kxQvDomainNumber);
        const auto* domain =
            found == reading.values.end() ? nullptr : std::get_if<std::uint32_t>(&found->second);
        clocks_.push_back(
            {{item, domain ? std::optional(*domain) : std::nullopt}, std::nullopt, {}, false});
    }
    return ExitCode::kSuccess;
}

void Watch::rediscover() {
    for (WatchedClock& clock : clocks_) {
        clock.silent = false;  // asked once more
    }
    if (named_) {
        return;
    }
    ExitCode ignored = ExitCode::kSuccess;
    for (ClockPort& port : context_.discover("watch", ignored)) {
        if (std::ranges::none_of(
                clocks_, [&](const WatchedClock& clock) { return clock.port.item == port.item; })) {
            clocks_.push_back({std::move(port), std::nullopt, {}, false});
        }
    }
}

void Watch::sample() {
    for (WatchedClock& clock : clocks_) {
        if (StopSignal::requested()) {
            return;
        }
        if (clock.silent) {
            clock.changes.clear();
            continue;
        }
        clock.update(context_.reader().read(clock.port.item, WatchView::tags()));
        clock.silent = !clock.answered();
    }
}

void Watch::show(unsigned number) const {
    const std::string time = formatUtc(utcNow());
    if (live_) {
        char heading[160];
        std::snprintf(heading, sizeof heading,
                      "corbel watch: every %g s, sample %u at %s (Ctrl-C ends)",
                      options_.intervalSeconds, number, time.c_str());
        Terminal::redraw(WatchView::screen(clocks_, heading));
        return;
    }
    for (const WatchedClock& clock : clocks_) {
        if (!clock.last) {
            continue;
        }
        if (options_.json) {
            context_.out().printJsonLine(WatchView::json(clock, time));
        } else {
            std::printf("%s\n", WatchView::line(clock, time).c_str());
        }
    }
    std::fflush(stdout);
}

void Watch::sleepUntil(Clock::time_point until) {
    constexpr auto kStep = std::chrono::milliseconds(100);
    while (!StopSignal::requested() && Clock::now() < until) {
        std::this_thread::sleep_for(std::min<Clock::duration>(kStep, until - Clock::now()));
    }
}

ExitCode Watch::run() {
    const auto interval = std::chrono::duration_cast<Clock::duration>(
        std::chrono::duration<double>(options_.intervalSeconds));
    const auto discoveryPeriod =
        std::max<Clock::duration>(kShortestDiscoveryPeriod, interval * kSamplesPerDiscovery);
    auto nextSample = Clock::now();
    auto nextDiscovery = nextSample + discoveryPeriod;
    for (unsigned number = 1; !StopSignal::requested(); ++number) {
        if (Clock::now() >= nextDiscovery) {
            rediscover();
            nextDiscovery = Clock::now() + discoveryPeriod;
        }
        sample();
        if (StopSignal::requested()) {
            break;
        }
        show(number);
        if (options_.count && number >= *options_.count) {
            break;
        }
        nextSample = std::max(nextSample + interval, Clock::now());
        sleepUntil(nextSample);
    }
    return ExitCode::kSuccess;
}

}  // namespace corbel
