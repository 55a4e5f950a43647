// Several host threads on one expert; run under ThreadSanitizer (label tsan).
#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using qvtest::ExpertFixture;

TEST_F(ExpertFixture, ThreadsShareOneExpert) {
    std::atomic<int> failures{0};
    auto work = [&] {
        qvtest::NameCollector collector;
        const kxSysAttributeTagID tags[] = {kxQvPriority1, kxQvPortState, kxQvUserDescription};
        for (int i = 0; i < 10; ++i) {
            CQVComPtr<IkxSysEnumStringList> names;
            CQVComPtr<IkxSysPropertyBag> bag;
            const HRESULT results[] = {
                expert->GetItemNames(names.Receive()),
                expert->EnumerateItems(&collector),
                expert->GetItem(kPort1, bag.Receive()),
                expert->GetItemProperties(kPort1, 3, tags, nullptr, bag.Receive()),
            };
            for (const HRESULT result : results) {
                failures += result == S_OK ? 0 : 1;
            }
        }
    };
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back(work);
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(failures.load(), 0);
}

}  // namespace
