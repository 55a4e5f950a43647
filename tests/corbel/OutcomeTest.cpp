#include <gtest/gtest.h>

#include "corbel/ChangeOutcome.h"
#include "corbel/ExitCode.h"
#include "corbel/ItemReader.h"

// The decisions behind an exit code, which scripts rely on: an operation's result and the
// expert's reason, a reading with groups that a clock does not support, and what a
// failed change wrote.

namespace {

using corbel::ExitCode;
using Kind = kxQvFailureKind;

corbel::FailureCause cause(HRESULT result, Kind kind, ULONG managementErrorId = 0,
                           kxSysAttributeTagID tag = 0) {
    corbel::FailureCause made = corbel::FailureCause::of(result);
    made.kind = kind;
    made.managementErrorId = managementErrorId;
    made.tag = tag;
    return made;
}

TEST(Outcome, ExitCodeOfAResultAndItsReason) {
    const struct {
        HRESULT result;
        Kind kind;
        ExitCode expected;
    } cases[] = {
        {S_OK, Kind::none, ExitCode::kSuccess},
        {S_FALSE, Kind::none, ExitCode::kNothingFound},  // no clock answered
        {S_FALSE, Kind::network, ExitCode::kFailed},     // discovery failed
        {CORBEL_E_ITEM_NOT_FOUND, Kind::other, ExitCode::kNothingFound},
        {CORBEL_E_INVALID_VALUE, Kind::invalidValue, ExitCode::kRejected},
        {E_FAIL, Kind::refusedByClock, ExitCode::kFailed},
        {E_FAIL, Kind::noAnswer, ExitCode::kFailed},
        {E_NOT_VALID_STATE, Kind::none, ExitCode::kNoExpert},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(static_cast<int>(test.expected));
        EXPECT_EQ(corbel::exitCodeOf(test.result, test.kind), test.expected);
    }
    EXPECT_EQ(corbel::worse(ExitCode::kNothingFound, ExitCode::kFailed), ExitCode::kFailed);
    EXPECT_EQ(corbel::worse(ExitCode::kNothingFound, ExitCode::kSuccess), ExitCode::kNothingFound);
}

TEST(Outcome, AReadingFailsOnlyForWhatTheClockShouldHaveAnswered) {
    const struct {
        corbel::FailureCause unread;
        bool tagsNamed;
        ExitCode expected;
    } cases[] = {
        {cause(E_FAIL, Kind::refusedByClock, 6), false, ExitCode::kSuccess},  // NOT_SUPPORTED
        {cause(E_FAIL, Kind::refusedByClock, 2), false, ExitCode::kSuccess},  // NO_SUCH_ID
        {cause(E_FAIL, Kind::refusedByClock, 6), true, ExitCode::kFailed},
        {cause(E_FAIL, Kind::refusedByClock, 0xFFFE), false, ExitCode::kFailed},
        {cause(E_FAIL, Kind::noAnswer), false, ExitCode::kFailed},
    };
    for (const auto& test : cases) {
        corbel::ItemReading reading;
        reading.unread = {{kxQvTime, test.unread}};
        EXPECT_EQ(reading.outcome(test.tagsNamed), test.expected) << test.unread.words();
    }
    corbel::ItemReading unknown;
    unknown.lookupFailure = cause(CORBEL_E_ITEM_NOT_FOUND, Kind::other);
    EXPECT_EQ(unknown.outcome(false), ExitCode::kNothingFound);
}

TEST(Outcome, AChangeStopsAtTheTagTheExpertNames) {
    using Tags = std::vector<kxSysAttributeTagID>;
    const Tags changed = {kxQvPriority2, kxQvUserDescription, kxQvPriority1};
    const struct {
        corbel::FailureCause failure;
        Tags written, notSent, unknown;
    } cases[] = {
        {cause(S_OK, Kind::none), {kxQvUserDescription, kxQvPriority1, kxQvPriority2}, {}, {}},
        {cause(E_FAIL, Kind::noAnswer, 0, kxQvPriority1),
         {kxQvUserDescription},
         {kxQvPriority2},
         {}},
        {cause(E_FAIL, Kind::other), {}, {}, {kxQvUserDescription, kxQvPriority1, kxQvPriority2}},
    };
    for (const auto& test : cases) {
        const auto outcome = corbel::ChangeOutcome::of(changed, test.failure);
        EXPECT_EQ(outcome.written, test.written);
        EXPECT_EQ(outcome.notSent, test.notSent);
        EXPECT_EQ(outcome.unknown, test.unknown);
        EXPECT_EQ(outcome.failed.has_value(), test.failure.tag != 0);
    }
}

}  // namespace
