#ifndef QV_TESTS_EXPERT_CLOCKS_EXPERTFIXTURE_H
#define QV_TESTS_EXPERT_CLOCKS_EXPERTFIXTURE_H

#include <gtest/gtest.h>
#include <stdlib.h>

#include <cstdint>
#include <filesystem>
#include <string>
#include <tuple>
#include <vector>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "expert/CkxDynamicPropertyBag.h"
#include "expert/clocks/CPtpSysExpert.h"
#include "platform/EnvironmentVariable.h"
#include "platform/FindClocksTimeout.h"
#include "platform/OleText.h"
#include "ptp/tManagementMessagePayload.h"
#include "tests/expert/clocks/BagText.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

namespace qvtest {

using tTags = std::vector<kxSysAttributeTagID>;
// What IkxQvLastFailure2 says: kind, managementErrorId, tag.
using tCause = std::tuple<kxQvFailureKind, ULONG, kxSysAttributeTagID>;
using tExpert = CQVComPtr<CQVComObject<CPtpSysExpert>>;

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
    static constexpr const OLECHAR* kPort1 = OLESTR("02-11-22-FF-FE-33-44-55:1");

    // Lock files of the test's own (on POSIX).
    static void SetUpTestSuite() {
#ifndef _WIN32
        char folder[] = "/tmp/qv-expert-XXXXXX";
        ASSERT_NE(::mkdtemp(folder), nullptr);
        lockFolder_ = folder;
        qv::dsc::osdep::EnvironmentVariable::set("QV_LOCK_DIR", folder);
#endif
    }
    static void TearDownTestSuite() {
        std::error_code ignored;
        std::filesystem::remove_all(lockFolder_, ignored);
    }
    ExpertFixture() : clock(identity(0x55), 2) {
        network.attach(clock);
        expert = newExpert(network);
        CQVComPtr<IkxSysEnumStringList> names;
        EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
        newRequests();
    }
    ~ExpertFixture() override {
        expert->Shutdown();
    }

    // An expert whose discovery waits `waitMs`.
    static tExpert newExpert(nQVPTP000::iPTPPortMessaging& on, unsigned waitMs = 30) {
        qv::dsc::osdep::EnvironmentVariable::set(
            qv::dsc::osdep::FindClocksTimeout::kOverrideVariable, std::to_string(waitMs).c_str());
        CQVComObject<CPtpSysExpert>* created = nullptr;
        EXPECT_EQ(CQVComObject<CPtpSysExpert>::CreateInstance(&created), S_OK);
        tExpert held(created);
        EXPECT_EQ(held->UseTransport(on), S_OK);
        EXPECT_EQ(held->Initialize(), S_OK);
        return held;
    }
    static CQVComPtr<IkxSysPropertyBag2> newBag() {
        IkxSysPropertyBag2* created = nullptr;
        EXPECT_EQ(CQVComObject<CkxDynamicPropertyBag>::CreateReferenced(&created), S_OK);
        return CQVComPtr<IkxSysPropertyBag2>::Adopt(created);
    }
    // 02-11-22-FF-FE-33-44-last
    static nQVPTP000::tClockIdentity identity(std::uint8_t last) {
        const std::uint8_t octets[8] = {0x02, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, last};
        return nQVPTP000::tClockIdentity(octets);
    }
    // GetItemProperties of port 1.
    HRESULT read(const tTags& tags, CQVComPtr<IkxSysPropertyBag>& bag) {
        return expert->GetItemProperties(kPort1, static_cast<ULONG>(tags.size()), tags.data(),
                                         nullptr, bag.Receive());
    }
    // Why the calling thread's last operation failed, in words (ASCII) and as numbers.
    std::string lastFailure() {
        CQVComPtr<IkxQvLastFailure2> failure;
        expert->QueryInterface(IID_IkxQvLastFailure2, reinterpret_cast<void**>(failure.Receive()));
        if (!failure) {
            return "(no IkxQvLastFailure2)";
        }
        BSTR description = nullptr;
        failure->GetLastFailure(&description, nullptr);
        const std::u16string text = qv::dsc::OleText::toLibrary(description);
        SysFreeString(description);
        return std::string(text.begin(), text.end());
    }
    tCause lastCause() {
        ULONG kind = 0;
        tCause cause;
        static_cast<IkxQvLastFailure2*>(expert.get())
            ->GetLastFailureCause(&kind, &std::get<1>(cause), &std::get<2>(cause));
        std::get<0>(cause) = static_cast<kxQvFailureKind>(kind);
        return cause;
    }
    // The management ids of the requests sent since the last call.
    std::vector<std::uint16_t> newRequests() {
        const auto sent = network.sentDatagrams();
        std::vector<std::uint16_t> ids;
        tStatus status;
        for (std::size_t i = requestsSeen_; i < sent.size(); ++i) {
            const auto request = decodeManagement(sent[i]);
            ids.push_back(request ? request->getPayload(status)->getManagementId() : 0xFFFF);
        }
        requestsSeen_ = sent.size();
        return ids;
    }

    inline static std::string lockFolder_;  // the discovery lock's folder, the suite's own
    SimulatedNetwork network;
    SimulatedClock clock;
    InMemoryManagedClock& managed = clock.managed();
    tExpert expert;
    std::size_t requestsSeen_ = 0;
};

}  // namespace qvtest

#endif
