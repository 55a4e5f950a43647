#ifndef QV_TESTS_EXPERT_CLOCKS_EXPERTFIXTURE_H
#define QV_TESTS_EXPERT_CLOCKS_EXPERTFIXTURE_H

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "expert/clocks/CPtpSysExpert.h"
#include "tests/expert/clocks/BagText.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

namespace qvtest {

using tTags = std::vector<kxSysAttributeTagID>;

// A host's item collector that keeps the item names it is given.
struct NameCollector final : IkxSysItemCollector {
    HRESULT KXSYS_CALL QueryInterface(const IID&, void**) override { return E_NOINTERFACE; }
    ULONG KXSYS_CALL AddRef() override { return 2; }
    ULONG KXSYS_CALL Release() override { return 1; }
    HRESULT KXSYS_CALL ReservedCollector1() override { return E_NOTIMPL; }
    HRESULT KXSYS_CALL ReservedCollector2() override { return E_NOTIMPL; }
    HRESULT KXSYS_CALL AddItem(IkxSysPropertyBag* item) override {
        names.push_back(textOf(*item, kxQvClockPortName));
        return S_OK;
    }
    std::vector<std::string> names;
};

// An initialised expert whose node talks, in memory, to one simulated clock with two ports,
// 02-11-22-FF-FE-33-44-55, after one discovery. Discovery waits 30 ms.
class ExpertFixture : public ::testing::Test {
  protected:
    static constexpr const char16_t* kPort1 = u"02-11-22-FF-FE-33-44-55:1";

    static void SetUpTestSuite();
    ExpertFixture();
    ~ExpertFixture() override;

    static CQVComPtr<CQVComObject<CPtpSysExpert>> newExpert(nQVPTP000::iPTPPortMessaging& network,
                                                            bool initialize = true);
    static CQVComPtr<IkxSysPropertyBag2> newBag();
    static nQVPTP000::tClockIdentity identity(std::uint8_t last);  // 02-11-22-FF-FE-33-44-last

    // GetItemProperties of port 1.
    HRESULT read(const tTags& tags, CQVComPtr<IkxSysPropertyBag>& bag);
    // The management ids of the requests sent since the last call.
    std::vector<std::uint16_t> newRequests();

    SimulatedNetwork network;
    SimulatedClock clock;
    InMemoryManagedClock& managed = clock.managed();
    CQVComPtr<CQVComObject<CPtpSysExpert>> expert;
    std::size_t requestsSeen_ = 0;
};

}  // namespace qvtest

#endif
