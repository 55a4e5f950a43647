#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "ptp/TLVs/tClockAccuracyTLV.h"
#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tTimescalePropertiesTLV.h"
#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "ptp/tManagementIdTable.h"
#include "tests/ptp/PduTestSupport.h"

// Answers of real clocks (tests/data/corpus): the TLV after the 48 octets of header and
// management body is decoded by the class of its management id; the expected values are
// those that the peer's own management client printed for the same datagram.

using namespace nQVPTP000;

namespace {

constexpr std::size_t kHeaderAndBody = 48;

std::unique_ptr<tManagementTLV> decodeCorpus(const std::string& name) {
    std::ifstream in(std::string(QV_SOURCE_DIR) + "/tests/data/corpus/" + name + ".hex");
    EXPECT_TRUE(in.good()) << name;
    std::stringstream text;
    text << in.rdbuf();
    const auto datagram = qvtest::hexOctets(text.str());
    if (datagram.size() < kHeaderAndBody + 6) {
        ADD_FAILURE() << name << " is too short";
        return nullptr;
    }
    const std::uint16_t id = static_cast<std::uint16_t>(datagram[kHeaderAndBody + 4] << 8 |
                                                        datagram[kHeaderAndBody + 5]);
    const tManagementIdEntry* row = findManagementId(id);
    if (row == nullptr) {
        ADD_FAILURE() << name << ": no class for management id " << id;
        return nullptr;
    }
    auto tlv = row->create();
    tStatus status;
    tProtocolDataUnit unit(status);
    unit.writeOctets(datagram.data() + kHeaderAndBody, datagram.size() - kHeaderAndBody, status);
    tlv->deserialize(unit, status);
    EXPECT_TRUE(status.succeeded()) << name << ": " << status.code;
    // The TLV ends where the datagram ends: nothing is left unread.
    EXPECT_EQ(std::size_t{tlv->getSize()}, datagram.size() - kHeaderAndBody) << name;
    // Written again, it gives back the octets the clock sent.
    EXPECT_EQ(qvtest::encode(*tlv),
              qvtest::hexText(datagram.data() + kHeaderAndBody, datagram.size() - kHeaderAndBody))
        << name;
    return tlv;
}

template <typename T>
std::unique_ptr<T> corpus(const std::string& name) {
    auto tlv = decodeCorpus(name);
    auto* typed = dynamic_cast<T*>(tlv.get());
    EXPECT_NE(typed, nullptr) << name;
    if (typed == nullptr) {
        return nullptr;
    }
    tlv.release();
    return std::unique_ptr<T>(typed);
}

// The form the peer's client prints: "020000.fffe.000001".
std::string identity(const tClockIdentity& id) {
    char text[24];
    std::snprintf(text, sizeof(text), "%02x%02x%02x.%02x%02x.%02x%02x%02x", id[0], id[1], id[2],
                  id[3], id[4], id[5], id[6], id[7]);
    return text;
}

std::string octets(std::span<const std::uint8_t> data) {
    std::string text;
    for (std::uint8_t octet : data) {
        char piece[4];
        std::snprintf(piece, sizeof(piece), "%s%02x", text.empty() ? "" : ":", octet);
        text += piece;
    }
    return text;
}

TEST(CorpusTlvTest, DefaultDataSets) {
    const auto alpha = corpus<tDefaultDataSetTLV>("ptp4l-mgmt-default_data_set");
    ASSERT_NE(alpha, nullptr);
    EXPECT_TRUE(alpha->getTwoStepFlag());
    EXPECT_FALSE(alpha->getSlaveOnly());
    EXPECT_EQ(alpha->getNumberPorts(), 1);
    EXPECT_EQ(alpha->getPriority1(), 100);
    EXPECT_EQ(alpha->getClockQuality().clockClass, 128);
    EXPECT_EQ(alpha->getClockQuality().clockAccuracy, 0xFEU);
    EXPECT_EQ(alpha->getClockQuality().offsetScaledLogVariance, 0xFFFF);
    EXPECT_EQ(alpha->getPriority2(), 128);
    EXPECT_EQ(identity(alpha->getClockIdentity()), "020000.fffe.000001");
    EXPECT_EQ(alpha->getDomainNumber(), 0);

    const auto ptpd = corpus<tDefaultDataSetTLV>("ptpd-mgmt-default_data_set");
    ASSERT_NE(ptpd, nullptr);
    EXPECT_FALSE(ptpd->getTwoStepFlag());
    EXPECT_EQ(ptpd->getClockQuality().clockClass, 13);
    EXPECT_EQ(identity(ptpd->getClockIdentity()), "020000.fffe.000003");
    EXPECT_EQ(ptpd->getDomainNumber(), 2);
}

TEST(CorpusTlvTest, CurrentAndParentDataSets) {
    const auto current = corpus<tCurrentDataSetTLV>("ptp4l-mgmt-current_data_set");
    ASSERT_NE(current, nullptr);
    EXPECT_EQ(current->getStepsRemoved(), 0);
    EXPECT_EQ(current->getOffsetFromMaster().getScaledNanoseconds(), 0);
    EXPECT_EQ(current->getMeanPathDelay().getScaledNanoseconds(), 0);

    const auto alpha = corpus<tParentDataSetTLV>("ptp4l-mgmt-parent_data_set");
    ASSERT_NE(alpha, nullptr);
    EXPECT_EQ(identity(alpha->getParentPortIdentity().getClockIdentity()), "020000.fffe.000001");
    EXPECT_EQ(alpha->getParentPortIdentity().getPortNumber(), 0);
    EXPECT_FALSE(alpha->getParentStats());
    EXPECT_EQ(alpha->getObservedParentOffsetScaledLogVariance(), 0xFFFF);
    EXPECT_EQ(alpha->getObservedParentClockPhaseChangeRate(), 0x7FFFFFFF);
    EXPECT_EQ(alpha->getGrandmasterPriority1(), 100);
    EXPECT_EQ(alpha->getGrandmasterClockQuality().clockClass, 128);
    EXPECT_EQ(alpha->getGrandmasterPriority2(), 128);
    EXPECT_EQ(identity(alpha->getGrandmasterIdentity()), "020000.fffe.000001");

    const auto ptpd = corpus<tParentDataSetTLV>("ptpd-mgmt-parent_data_set");
    ASSERT_NE(ptpd, nullptr);
    EXPECT_EQ(ptpd->getParentPortIdentity().getPortNumber(), 1);
    EXPECT_EQ(ptpd->getObservedParentClockPhaseChangeRate(), 0);
    EXPECT_EQ(ptpd->getGrandmasterClockQuality().clockClass, 13);
}

TEST(CorpusTlvTest, TimePropertiesAndPortDataSets) {
    const auto time = corpus<tTimePropertiesDataSetTLV>("ptp4l-mgmt-time_properties_data_set");
    ASSERT_NE(time, nullptr);
    EXPECT_EQ(time->getCurrentUtcOffset(), 37);
    EXPECT_FALSE(time->getLeap61() || time->getLeap59() || time->getCurrentUtcOffsetValid() ||
                 time->getPtpTimescale() || time->getTimeTraceable() ||
                 time->getFrequencyTraceable());
    EXPECT_EQ(time->getTimeSource(), 0xA0);

    const auto alpha = corpus<tPortDataSetTLV>("ptp4l-mgmt-port_data_set");
    ASSERT_NE(alpha, nullptr);
    EXPECT_EQ(alpha->getPortIdentity().getPortNumber(), 1);
    EXPECT_EQ(alpha->getPortState(), 6);  // MASTER
    EXPECT_EQ(alpha->getLogAnnounceInterval(), 1);
    EXPECT_EQ(alpha->getAnnounceReceiptTimeout(), 3);
    EXPECT_EQ(alpha->getDelayMechanism(), 1);
    EXPECT_EQ(alpha->getVersionNumber(), 2);

    const auto ptpd = corpus<tPortDataSetTLV>("ptpd-mgmt-port_data_set");
    ASSERT_NE(ptpd, nullptr);
    EXPECT_EQ(ptpd->getAnnounceReceiptTimeout(), 6);
    EXPECT_EQ(ptpd->getLogMinPdelayReqInterval(), 1);
}

TEST(CorpusTlvTest, ClockDescriptions) {
    const auto alpha = corpus<tClockDescriptionTLV>("ptp4l-mgmt-clock_description");
    ASSERT_NE(alpha, nullptr);
    EXPECT_TRUE(alpha->getOrdinaryClock());  // clockType 0x8000
    EXPECT_EQ(alpha->getPhysicalLayerProtocol().view(), "IEEE 802.3");
    EXPECT_EQ(octets(alpha->getPhysicalAddress()), "02:00:00:00:00:01");
    EXPECT_EQ(alpha->getProtocolAddress().getNetworkProtocol(), 1);
    EXPECT_EQ(octets({alpha->getProtocolAddress().getAddressField(), 4}), "a9:fe:01:01");
    EXPECT_EQ(octets(alpha->getManufacturerIdentity()), "00:00:00");
    EXPECT_EQ(alpha->getProductDescription().view(), ";;");
    EXPECT_EQ(alpha->getRevisionData().view(), ";;");
    EXPECT_EQ(alpha->getUserDescription().view(), "alpha");
    EXPECT_EQ(octets(alpha->getProfileIdentity()), "00:1b:19:00:01:00");
    EXPECT_TRUE(alpha->getPadNeeded());

    const auto ptpd = corpus<tClockDescriptionTLV>("ptpd-mgmt-clock_description");
    ASSERT_NE(ptpd, nullptr);
    EXPECT_EQ(octets(ptpd->getPhysicalAddress()), "02:00:00:00:00:03");
    EXPECT_EQ(octets(ptpd->getManufacturerIdentity()), "ff:ff:ff");
    EXPECT_EQ(ptpd->getRevisionData().view(), ";;2.3");
    EXPECT_EQ(ptpd->getUserDescription().view(), "PTPDv2");
    EXPECT_EQ(octets(ptpd->getProfileIdentity()), "00:00:00:00:00:00");
}

TEST(CorpusTlvTest, UserDescriptionsWithAndWithoutPad) {
    const auto alpha = corpus<tUserDescriptionTLV>("ptp4l-mgmt-user_description");
    ASSERT_NE(alpha, nullptr);
    EXPECT_EQ(alpha->getUserDescription().view(), "alpha");
    const auto ptpd = corpus<tUserDescriptionTLV>("ptpd-mgmt-user_description");
    ASSERT_NE(ptpd, nullptr);
    EXPECT_EQ(ptpd->getUserDescription().view(), "PTPDv2");
    EXPECT_EQ(ptpd->getLengthField(), 10);
}

// The single-value answers, as "name value" in the form the peer's client prints them.
TEST(CorpusTlvTest, SingleValues) {
    const std::pair<const char*, const char*> answers[] = {
        {"ptp4l-mgmt-priority1", "priority1: 100\n"},
        {"ptp4l-mgmt-priority2", "priority2: 128\n"},
        {"ptp4l-mgmt-domain", "domainNumber: 0\n"},
        {"ptp4l-mgmt-slave_only", "slaveOnly: false(0)\n"},
        {"ptp4l-mgmt-log_announce_interval", "logAnnounceInterval: 1\n"},
        {"ptp4l-mgmt-announce_receipt_timeout", "announceReceiptTimeout: 3\n"},
        {"ptp4l-mgmt-log_sync_interval", "logSyncInterval: 0\n"},
        {"ptp4l-mgmt-version_number", "versionNumber: 2\n"},
        {"ptp4l-mgmt-clock_accuracy", "clockAccuracy: 0xfe\n"},
        {"ptp4l-mgmt-delay_mechanism", "delayMechanism: 1\n"},
        {"ptp4l-mgmt-log_min_pdelay_req_interval", "logMinPdelayReqInterval: 0\n"},
        {"ptpd-mgmt-priority1-set-response", "priority1: 90\n"},
        {"ptpd-mgmt-announce_receipt_timeout", "announceReceiptTimeout: 6\n"},
        {"ptpd-mgmt-log_min_pdelay_req_interval", "logMinPdelayReqInterval: 1\n"},
    };
    for (const auto& [name, value] : answers) {
        const auto tlv = decodeCorpus(name);
        ASSERT_NE(tlv, nullptr) << name;
        const std::string text = qvtest::traceText(*tlv);
        EXPECT_EQ(text.substr(text.find("managementId: ") + 21), value) << name;
    }
}

TEST(CorpusTlvTest, PropertiesAndTime) {
    const auto traceability =
        corpus<tTraceabilityPropertiesTLV>("ptp4l-mgmt-traceability_properties");
    ASSERT_NE(traceability, nullptr);
    EXPECT_FALSE(traceability->getTimeTraceable() || traceability->getFrequencyTraceable());
    const auto timescale = corpus<tTimescalePropertiesTLV>("ptp4l-mgmt-timescale_properties");
    ASSERT_NE(timescale, nullptr);
    EXPECT_FALSE(timescale->getPtpTimescale());

    // Requests built by the capture script: values as tshark shows them.
    const auto utc = corpus<tUTCPropertiesTLV>("ptpd-mgmt-utc_properties");
    ASSERT_NE(utc, nullptr);
    EXPECT_EQ(utc->getCurrentUtcOffset(), 0);
    const auto time = corpus<tTimeTLV>("ptpd-mgmt-time");
    ASSERT_NE(time, nullptr);
    EXPECT_EQ(time->getCurrentTime(), tTimestamp(1796558906, 995830539));
}

}  // namespace
