#include "tests/expert/clocks/ExpertFixture.h"

#include <stdlib.h>

#include <filesystem>
#include <fstream>

#include "expert/CkxDynamicPropertyBag.h"
#include "ptp/tManagementMessagePayload.h"

namespace qvtest {

void ExpertFixture::SetUpTestSuite() {
    // Settings and lock files of the test's own.
    char folder[] = "/tmp/qv-expert-XXXXXX";
    ASSERT_NE(::mkdtemp(folder), nullptr);
    const auto key = std::filesystem::path(folder) / "Software/Quarvel/Corbel/qv-1588";
    std::filesystem::create_directories(key);
    std::ofstream(key / "findClocksTimeout") << "30\n";
    ::setenv("QV_SETTINGS_ROOT", folder, 1);
    ::setenv("QV_LOCK_DIR", folder, 1);
}

ExpertFixture::ExpertFixture() : clock(identity(0x55), 2) {
    network.attach(clock);
    expert = newExpert(network);
    CQVComPtr<IkxSysEnumStringList> names;
    EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
    newRequests();
}

ExpertFixture::~ExpertFixture() {
    expert->Shutdown();
}

nQVPTP000::tClockIdentity ExpertFixture::identity(std::uint8_t last) {
    const std::uint8_t octets[8] = {0x02, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, last};
    return nQVPTP000::tClockIdentity(octets);
}

CQVComPtr<CQVComObject<CPtpSysExpert>> ExpertFixture::newExpert(
    nQVPTP000::iPTPPortMessaging& network, bool initialize) {
    CQVComObject<CPtpSysExpert>* created = nullptr;
    EXPECT_EQ(CQVComObject<CPtpSysExpert>::CreateInstance(&created), S_OK);
    CQVComPtr<CQVComObject<CPtpSysExpert>> held(created);
    EXPECT_EQ(held->UseTransport(network), S_OK);
    EXPECT_EQ(initialize ? held->Initialize() : S_OK, S_OK);
    return held;
}

CQVComPtr<IkxSysPropertyBag2> ExpertFixture::newBag() {
    CQVComObject<CkxDynamicPropertyBag>* created = nullptr;
    EXPECT_EQ(CQVComObject<CkxDynamicPropertyBag>::CreateInstance(&created), S_OK);
    return CQVComPtr<IkxSysPropertyBag2>(created);
}

HRESULT ExpertFixture::read(const tTags& tags, CQVComPtr<IkxSysPropertyBag>& bag) {
    return expert->GetItemProperties(kPort1, static_cast<ULONG>(tags.size()), tags.data(), nullptr,
                                     bag.Receive());
}

std::vector<std::uint16_t> ExpertFixture::newRequests() {
    const auto sent = network.sentDatagrams();
    std::vector<std::uint16_t> ids;
    for (std::size_t i = requestsSeen_; i < sent.size(); ++i) {
        tStatus status;
        const auto request = decodeManagement(sent[i]);
        ids.push_back(request ? request->getPayload(status)->getManagementId() : 0xFFFF);
    }
    requestsSeen_ = sent.size();
    return ids;
}

}  // namespace qvtest
