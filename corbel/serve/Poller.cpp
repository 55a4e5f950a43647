#include "corbel/serve/Poller.h"

#include <algorithm>

#include "corbel/ValueWords.h"
#include "corbel/serve/ApiJson.h"

namespace corbel {

namespace {

using Steady = std::chrono::steady_clock;

// "02-11-22-FF-FE-33-44-55" of "02-11-22-FF-FE-33-44-55:1".
std::string identityOf(const std::string& item) {
    return item.substr(0, item.find(':'));
}

template <typename T>
std::optional<T> valueOf(const ClockStatus& clock, kxSysAttributeTagID tag) {
    const T* value = clock.value<T>(tag);
    return value != nullptr ? std::optional<T>(*value) : std::nullopt;
}

std::string namesOf(const std::vector<std::string>& names) {
    std::string text;
    for (const std::string& name : names) {
        text += (text.empty() ? "" : ", ") + name;
    }
    return text;
}

}  // namespace

Poller::Poller(ClockSource& source, ServiceState& state, PollTiming timing)
    : source_(source), state_(state), timing_(timing) {}

Poller::~Poller() {
    stop();
}

void Poller::start() {
    thread_ = std::thread([this] { run(); });
}

void Poller::stop() {
    {
        const std::lock_guard guard(lock_);
        stopping_ = true;
    }
    wake_.notify_all();
    if (thread_.joinable()) {
        thread_.join();
    }
    const std::lock_guard guard(lock_);
    for (WriteJob& job : writes_) {
        WriteOutcome outcome;
        outcome.result = WriteOutcome::Result::refused;
        outcome.reason = "the service is stopping";
        job.done.set_value(outcome);
    }
    writes_.clear();
}

WriteOutcome Poller::write(const std::string& item, std::vector<Setting> settings) {
    std::future<WriteOutcome> done;
    {
        const std::lock_guard guard(lock_);
        if (stopping_) {
            WriteOutcome outcome;
            outcome.result = WriteOutcome::Result::refused;
            outcome.reason = "the service is stopping";
            return outcome;
        }
        writes_.push_back({item, std::move(settings), {}});
        done = writes_.back().done.get_future();
    }
    wake_.notify_all();
    return done.get();
}

bool Poller::stopping() {
    const std::lock_guard guard(lock_);
    return stopping_;
}

void Poller::run() {
    auto nextDiscovery = Steady::now();
    auto nextRead = nextDiscovery;
    bool afterDiscovery = false;
    while (!stopping()) {
        serveWrites();
        if (Steady::now() >= nextDiscovery) {
            discover();
            nextDiscovery = Steady::now() + timing_.rediscover;
            afterDiscovery = true;
        }
        if (Steady::now() >= nextRead && !stopping()) {
            readAll(afterDiscovery);
            afterDiscovery = false;
            // A round that took longer than the interval is followed by the next at once.
            nextRead = std::max(nextRead + timing_.interval, Steady::now());
            publish();
        }
        std::unique_lock guard(lock_);
        wake_.wait_until(guard, std::min(nextDiscovery, nextRead),
                         [this] { return stopping_ || !writes_.empty(); });
    }
}

void Poller::discover() {
    const WallTime started = std::chrono::system_clock::now();
    const auto began = Steady::now();
    DiscoveryOutcome outcome = source_.discover();
    countFailures(outcome.failedExchanges);
    const std::chrono::duration<double> took = Steady::now() - began;
    for (const std::string& item : outcome.items) {
        if (clocks_.contains(item)) {
            continue;
        }
        Tracked& clock = clocks_[item];
        clock.status.item = item;
        clock.status.clockIdentity = identityOf(item);
        clock.status.lastSeen = started;
        clock.status.history = std::make_shared<History>();
        addEvent(item, "appeared", item + " answered a discovery", nlohmann::ordered_json::object(),
                 started);
    }
    discovery_ = DiscoveryStatus{started, took.count(), clocks_.size()};
    publish();
}

void Poller::readAll(bool withVanished) {
    const auto began = Steady::now();
    for (auto& [item, clock] : clocks_) {
        if (stopping()) {
            return;
        }
        if (clock.status.present || withVanished) {
            read(clock);
        }
        serveWrites();
    }
    roundSeconds_ = std::chrono::duration<double>(Steady::now() - began).count();
}

void Poller::read(Tracked& clock) {
    ClockReading reading = source_.read(clock.status.item, clock.unsupported, !clock.baseRead);
    countFailures(reading.failedExchanges);
    const WallTime now = std::chrono::system_clock::now();
    const ClockStatus before = clock.status;
    merge(clock, reading, now);
    noteChanges(before, clock.status, now);
    const ClockStatus& after = clock.status;
    HistorySample sample;
    sample.unixMilliseconds = unixMilliseconds(now);
    if (reading.answered) {
        sample.offsetFromMaster = valueOf<double>(after, kxQvOffsetFromMaster);
        sample.meanPathDelay = valueOf<double>(after, kxQvMeanPathDelay);
        sample.portState = valueOf<std::int32_t>(after, kxQvPortState);
    }
    after.history->append(sample);
}

// A group read now replaces what was known of it: its values, or why it was not read.
void Poller::merge(Tracked& clock, ClockReading& reading, WallTime now) {
    ClockStatus& status = clock.status;
    status.lastRead = now;
    status.lastReadOk = reading.answered &&
                        std::ranges::all_of(reading.failedExchanges, &FailureCause::notSupported);
    if (!reading.answered) {
        status.present = false;
        return;
    }
    clock.baseRead = true;
    status.present = true;
    status.lastSeen = now;
    for (auto& [tag, value] : reading.values) {
        status.unread.erase(tag);
        status.values.insert_or_assign(tag, std::move(value));
    }
    for (auto& [tag, failure] : reading.unread) {
        status.values.erase(tag);
        status.unread.insert_or_assign(tag, std::move(failure));
    }
    for (const std::size_t group : reading.unsupportedGroups) {
        clock.unsupported.push_back(group);
    }
}

void Poller::noteChanges(const ClockStatus& before, const ClockStatus& after, WallTime now) {
    const std::string& item = after.item;
    if (before.present != after.present) {
        addEvent(item, after.present ? "appeared" : "vanished",
                 item + (after.present ? " answers again" : " stopped answering"),
                 nlohmann::ordered_json::object(), now);
    }
    const auto stateBefore = valueOf<std::int32_t>(before, kxQvPortState);
    const auto stateAfter = valueOf<std::int32_t>(after, kxQvPortState);
    if (stateBefore && stateAfter && *stateBefore != *stateAfter) {
        const std::string from = wordsOf(kxQvPortState, *stateBefore).word;
        const std::string to = wordsOf(kxQvPortState, *stateAfter).word;
        addEvent(item, "portState", item + ": port state " + from + " -> " + to,
                 {{"from", from}, {"to", to}}, now);
    }
    const auto masterBefore = valueOf<std::string>(before, kxQvGrandmasterIdentity);
    const auto masterAfter = valueOf<std::string>(after, kxQvGrandmasterIdentity);
    if (masterBefore && masterAfter && *masterBefore != *masterAfter) {
        addEvent(item, "grandmaster",
                 item + ": grandmaster " + *masterBefore + " -> " + *masterAfter,
                 {{"from", *masterBefore}, {"to", *masterAfter}}, now);
    }
}

void Poller::addEvent(const std::string& item, const char* kind, std::string message,
                      nlohmann::ordered_json detail, WallTime now) {
    state_.events().add({0, now, item, kind, std::move(message), std::move(detail)});
}

void Poller::serveWrites() {
    for (;;) {
        std::unique_lock guard(lock_);
        if (writes_.empty() || stopping_) {
            return;
        }
        WriteJob job = std::move(writes_.front());
        writes_.pop_front();
        guard.unlock();
        serve(job);
    }
}

void Poller::serve(WriteJob& job) {
    WriteOutcome outcome = source_.write(job.item, job.settings);
    countFailures(outcome.failedExchanges);
    const WallTime now = std::chrono::system_clock::now();
    const bool written = outcome.result == WriteOutcome::Result::written;
    std::string message = job.item + ": ";
    if (written) {
        message += namesOf(outcome.written) + " written";
    } else if (outcome.result == WriteOutcome::Result::rejected) {
        message += "rejected by validation, nothing sent";
    } else {
        message += outcome.refusedTag + " refused: " + outcome.reason;
    }
    addEvent(job.item, written ? "written" : "refused", message, writeJson(outcome), now);
    if (const auto found = clocks_.find(job.item); found != clocks_.end()) {
        read(found->second);
    }
    publish();
    job.done.set_value(std::move(outcome));
}

void Poller::countFailures(const std::vector<FailureCause>& failures) {
    for (const FailureCause& failure : failures) {
        state_.counters().countFailure(failure.kind);
    }
}

void Poller::publish() {
    auto snapshot = std::make_shared<Snapshot>();
    snapshot->discovery = discovery_;
    snapshot->roundSeconds = roundSeconds_;
    snapshot->clocks.reserve(clocks_.size());
    for (const auto& [item, clock] : clocks_) {
        snapshot->clocks.push_back(clock.status);
    }
    state_.publish(std::move(snapshot));
}

}  // namespace corbel
