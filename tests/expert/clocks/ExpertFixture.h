#ifndef QV_TESTS_EXPERT_CLOCKS_EXPERTFIXTURE_H
#define QV_TESTS_EXPERT_CLOCKS_EXPERTFIXTURE_H

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "expert/clocks/CPtpSysExpert.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

namespace qvtest {

// An initialised expert whose node talks to one simulated clock with two ports,
// 02-11-22-FF-FE-33-44-55, in memory, after one discovery. Discovery waits 30 ms.
class ExpertFixture : public ::testing::Test {
  protected:
    static constexpr const char16_t* kPort1 = u"02-11-22-FF-FE-33-44-55:1";

    static void SetUpTestSuite();
    ExpertFixture();
    ~ExpertFixture() override;

    // A new initialised expert on the same network (the fixture's is `expert`).
    static CQVComPtr<CQVComObject<CPtpSysExpert>> newExpert(nQVPTP000::iPTPPortMessaging& network,
                                                            bool initialize = true);
    static CQVComPtr<IkxSysPropertyBag2> newBag();
    // 02-11-22-FF-FE-33-44-`last`.
    static nQVPTP000::tClockIdentity identity(std::uint8_t last);

    // GetItemProperties of port 1; `bag` receives what came back.
    HRESULT read(const std::vector<kxSysAttributeTagID>& tags, CQVComPtr<IkxSysPropertyBag>& bag);
    // The management ids of the requests sent since the last call.
    std::vector<std::uint16_t> newRequests();

    InMemoryManagedClock& managed() { return clock.managed(); }

    SimulatedNetwork network;
    SimulatedClock clock;
    CQVComPtr<CQVComObject<CPtpSysExpert>> expert;
    std::size_t requestsSeen_ = 0;
};

}  // namespace qvtest

#endif
