// Several host threads on one expert; run under ThreadSanitizer (label tsan).
#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

#include "tests/expert/clocks/ExpertFixture.h"

namespace {

struct CountingCollector final : IkxSysItemCollector {
    HRESULT KXSYS_CALL QueryInterface(const IID&, void**) override { return E_NOINTERFACE; }
    ULONG KXSYS_CALL AddRef() override { return 2; }
    ULONG KXSYS_CALL Release() override { return 1; }
    HRESULT KXSYS_CALL ReservedCollector1() override { return E_NOTIMPL; }
    HRESULT KXSYS_CALL ReservedCollector2() override { return E_NOTIMPL; }
    HRESULT KXSYS_CALL AddItem(IkxSysPropertyBag*) override { return S_OK; }
};

TEST_F(qvtest::ExpertFixture, ThreadsShareOneExpert) {
    std::atomic<int> failures{0};
    auto work = [&] {
        CountingCollector collector;
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
