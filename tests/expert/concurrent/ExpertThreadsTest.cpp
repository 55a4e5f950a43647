// Several host threads on one expert; run under ThreadSanitizer (label tsan). The clock
// refuses TIME, as ptp4l does, so that every read fails in part and the management client
// traces each refusal while a sink listens.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"
#include "tests/support/TraceCapture.h"

namespace {

using qvtest::ExpertFixture;

TEST_F(ExpertFixture, ThreadsShareOneExpert) {
    clock.refuse(nQVPTP000::kTime);
    const qvtest::DebugOutputCapture trace;
    constexpr int kThreads = 4;
    constexpr int kRounds = 10;
    auto work = [&] {
        qvtest::NameCollector collector;
        const kxSysAttributeTagID tags[] = {kxQvPriority1, kxQvPortState, kxQvTime};
        for (int i = 0; i < kRounds; ++i) {
            CQVComPtr<IkxSysEnumStringList> names;
            CQVComPtr<IkxSysPropertyBag> bag;
            EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
            EXPECT_EQ(expert->EnumerateItems(&collector), S_OK);
            EXPECT_EQ(expert->GetItem(kPort1, bag.Receive()), S_OK);
            EXPECT_EQ(expert->GetItemProperties(kPort1, 3, tags, nullptr, bag.Receive()), E_FAIL);
            EXPECT_EQ(bag->HasTag(kxQvPriority1), S_OK);  // the groups that were not refused
            auto changes = newBag();
            changes->SetULong(kxQvPriority1, 256);
            CQVComPtr<IkxSysEnumPropertyTag> accepted;
            BSTR message = nullptr;
            EXPECT_EQ(expert->ValidateChanges(nullptr, changes.get(), accepted.Receive(), &message),
                      CORBEL_E_INVALID_VALUE);
            SysFreeString(message);
        }
    };
    {
        std::vector<std::jthread> threads;  // joined as the block ends
        for (int i = 0; i < kThreads; ++i) {
            threads.emplace_back(work);
        }
    }
    // One whole line per refusal.
    std::istringstream lines(trace.text());
    int count = 0;
    for (std::string line; std::getline(lines, line); ++count) {
        EXPECT_EQ(line.rfind("[qvptpmgmt3u--", 0), 0U) << line;
        EXPECT_NE(line.find("failed: refused by the clock: NOT_SUPPORTED"), line.npos) << line;
    }
    EXPECT_EQ(count, kThreads * kRounds);
}

}  // namespace
