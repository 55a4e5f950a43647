#include <gtest/gtest.h>

#include <mutex>
#include <thread>

#include "corbel/serve/Poller.h"

// The poller against a clock that changes from round to round: what it notes as events,
// keeps as history and publishes.

namespace {

using namespace corbel;
const std::string kItem = "02-11-22-FF-FE-33-44-55:1";

ClockReading answer(std::int32_t portState, const char* grandmaster) {
    ClockReading reading;
    reading.answered = true;
    reading.values = {{kxQvPortState, portState},
                      {kxQvGrandmasterIdentity, std::string(grandmaster)},
                      {kxQvOffsetFromMaster, -3.0}};
    return reading;
}

// One reading per round, the last repeated.
class ScriptedClock final : public ClockSource {
  public:
    explicit ScriptedClock(std::vector<ClockReading> rounds) : rounds_(std::move(rounds)) {}
    DiscoveryOutcome discover() override { return {{kItem}, {}}; }
    ClockReading read(const std::string&, const std::vector<std::size_t>&, bool) override {
        const std::lock_guard guard(lock_);
        return rounds_[std::min(reads_++, rounds_.size() - 1)];
    }
    WriteOutcome write(const std::string&, const std::vector<Setting>&) override { return {}; }

  private:
    std::mutex lock_;
    std::vector<ClockReading> rounds_;  // guarded by lock_
    std::size_t reads_ = 0;             // guarded by lock_
};

TEST(ServePoller, NotesChangesAsEventsKeepsHistoryAndMarksAClockThatStopsAnswering) {
    ClockReading silence;
    silence.failedExchanges.push_back(FailureCause::of(E_FAIL));
    silence.failedExchanges.back().kind = kxQvFailureKind::noAnswer;
    ScriptedClock clock({answer(6, "AA"), answer(9, "BB"), silence});
    ServiceState state;
    Poller poller(clock, state, {std::chrono::seconds(1), std::chrono::seconds(3600)});
    poller.start();
    std::uint64_t last = 0;
    for (int i = 0; i < 300 && last < 4; ++i) {  // at most 30 s: rounds are 1 s apart
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        state.events().after(0, last);
    }
    poller.stop();
    std::vector<std::string> seen;
    for (const Event& event : state.events().after(0, last)) {
        seen.push_back(event.kind + " " + event.detail.dump());
    }
    EXPECT_EQ(seen, (std::vector<std::string>{
                        "appeared {}", R"(portState {"from":"MASTER","to":"SLAVE"})",
                        R"(grandmaster {"from":"AA","to":"BB"})", "vanished {}"}));
    const auto snapshot = state.snapshot();
    ASSERT_EQ(snapshot->clocks.size(), 1u);
    EXPECT_FALSE(snapshot->clocks[0].present);
    const auto samples = snapshot->clocks[0].history->samples();
    ASSERT_EQ(samples.size(), 3u);
    EXPECT_EQ(samples[1].portState, 9);
    EXPECT_EQ(samples[2].offsetFromMaster, std::nullopt);
    EXPECT_EQ(state.counters().failures()[1], 1u);  // no_answer
}

}  // namespace

TEST(ServeHistory, KeepsTheNewestSamplesOldestFirst) {
    History history(3);
    for (std::int64_t time = 1; time <= 5; ++time) {
        history.append({time * 1000, -static_cast<double>(time), std::nullopt, 9});
    }
    std::vector<double> offsets;
    for (const HistorySample& sample : history.samples()) {
        offsets.push_back(*sample.offsetFromMaster);
    }
    EXPECT_EQ(offsets, (std::vector<double>{-3, -4, -5}));
}
