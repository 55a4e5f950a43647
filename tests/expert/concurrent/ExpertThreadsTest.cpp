// Several host threads on one expert; run under ThreadSanitizer (label tsan).
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using qvtest::ExpertFixture;

TEST_F(ExpertFixture, ThreadsShareOneExpert) {
    auto work = [&] {
        qvtest::NameCollector collector;
        const kxSysAttributeTagID tags[] = {kxQvPriority1, kxQvPortState, kxQvUserDescription};
        for (int i = 0; i < 10; ++i) {
            CQVComPtr<IkxSysEnumStringList> names;
            CQVComPtr<IkxSysPropertyBag> bag;
            EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
            EXPECT_EQ(expert->EnumerateItems(&collector), S_OK);
            EXPECT_EQ(expert->GetItem(kPort1, bag.Receive()), S_OK);
            EXPECT_EQ(expert->GetItemProperties(kPort1, 3, tags, nullptr, bag.Receive()), S_OK);
        }
    };
    std::vector<std::jthread> threads;  // joined as the test ends
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back(work);
    }
}

}  // namespace
