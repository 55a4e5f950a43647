#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <utility>
#include <vector>

#include "ptp/tManagementIdTable.h"
#include "tests/ptp/PduTestSupport.h"
#include "tests/support/TsharkDecode.h"

using namespace nQVPTP000;

namespace {

// One management TLV as received (tlvType onward), decoded by our class and written again
// by it, and the values tshark must show for it.
struct Case {
    const char* name;
    const char* octets;
    std::vector<std::pair<const char*, const char*>> shown;
};

void PrintTo(const Case& c, std::ostream* out) {
    *out << c.name;
}

// A management message header and body around the TLV: GET or RESPONSE, all ports of all
// clocks, sequence 0.
std::vector<std::uint8_t> managementAround(const std::string& tlv, std::uint8_t action) {
    auto datagram = qvtest::hexOctets(
        "0D 02 00 00 00 00 00 00 | 00 00 00 00 00 00 00 00 | 00 00 00 00 |"
        "02 00 00 FF FE 00 00 01 00 01 | 00 00 | 04 | 7F |"
        "FF FF FF FF FF FF FF FF FF FF | 00 | 00 | 00 | 00");
    datagram[46] = action;
    const auto payload = qvtest::hexOctets(tlv);
    datagram.insert(datagram.end(), payload.begin(), payload.end());
    datagram[3] = static_cast<std::uint8_t>(datagram.size());
    return datagram;
}

const std::vector<Case>& cases() {
    static const std::vector<Case> table = {
        {"NULL_MANAGEMENT", "00 01 00 02 00 00", {{"ptp.v2.mm.managementId", "0"}}},
        {"CLOCK_DESCRIPTION",
         "00 01 00 2A 00 01 | 40 00 | 03 61 62 63 | 00 06 | 02 00 00 00 00 01 |"
         "00 01 00 04 A9 FE 01 01 | 01 02 03 | 00 | 01 70 | 01 72 | 02 75 76 |"
         "00 1B 19 00 01 00 | 00",
         {{"ptp.v2.mm.clockType.BC", "1"},
          {"ptp.v2.mm.physicalLayerProtocol", "abc"},
          {"ptp.v2.mm.physicalAddress", "02:00:00:00:00:01"},
          {"ptp.v2.mm.protocolAddress", "a9:fe:01:01"},
          {"ptp.v2.mm.manufacturerIdentity", "01:02:03"},
          {"ptp.v2.mm.productDescription", "p"},
          {"ptp.v2.mm.revisionData", "r"},
          {"ptp.v2.mm.userDescription", "uv"},
          {"ptp.v2.mm.profileIdentity", "00:1b:19:00:01:00"}}},
        {"USER_DESCRIPTION",
         "00 01 00 06 00 02 | 02 61 62 | 00",
         {{"ptp.v2.mm.userDescription", "ab"}}},
        {"SAVE_IN_NON_VOLATILE_STORAGE", "00 01 00 02 00 03", {{"ptp.v2.mm.managementId", "3"}}},
        {"RESET_NON_VOLATILE_STORAGE", "00 01 00 02 00 04", {{"ptp.v2.mm.managementId", "4"}}},
        {"INITIALIZE", "00 01 00 04 00 05 | 12 34", {{"ptp.v2.mm.initializationKey", "4660"}}},
        {"FAULT_LOG",
         "00 01 00 16 00 06 | 00 01 | 00 0F | 00 00 00 00 00 05 00 00 00 07 | 03 |"
         "01 61 | 00 | 00 | 00",
         {{"ptp.v2.mm.numberOfFaultRecords", "1"},
          {"ptp.v2.mm.faultRecordLength", "15"},
          {"ptp.v2.mm.faultTime.seconds", "5"},
          {"ptp.v2.mm.faultTime.nanoseconds", "7"},
          {"ptp.v2.mm.severityCode", "3"},
          {"ptp.v2.mm.faultName", "a"}}},
        {"FAULT_LOG_RESET", "00 01 00 02 00 07", {{"ptp.v2.mm.managementId", "7"}}},
        {"DEFAULT_DATA_SET",
         "00 01 00 16 20 00 | 03 | 00 | 00 04 | 7F | 06 21 43 65 | 80 |"
         "01 02 03 04 05 06 07 08 | 2A | 00",
         {{"ptp.v2.mm.twoStep", "1"},
          {"ptp.v2.mm.SlavOnly", "1"},
          {"ptp.v2.mm.numberPorts", "4"},
          {"ptp.v2.mm.priority1", "127"},
          {"ptp.v2.mm.clockclass", "6"},
          {"ptp.v2.mm.clockaccuracy", "0x21"},
          {"ptp.v2.mm.clockvariance", "17253"},
          {"ptp.v2.mm.priority2", "128"},
          {"ptp.v2.mm.clockidentity", "0x0102030405060708"},
          {"ptp.v2.mm.domainNumber", "42"}}},
        {"CURRENT_DATA_SET",
         "00 01 00 14 20 01 | 00 02 | 00 00 00 00 00 03 00 00 | 00 00 00 00 00 0A 00 00",
         {{"ptp.v2.mm.stepsRemoved", "2"},
          {"ptp.v2.mm.offset.ns", "3"},
          {"ptp.v2.mm.pathDelay.ns", "10"}}},
        {"PARENT_DATA_SET",
         "00 01 00 22 20 02 | 01 02 03 04 05 06 07 08 00 03 | 01 | 00 | 12 34 |"
         "FF FF FF FE | 0A | 0D 22 56 78 | 0B | 11 12 13 14 15 16 17 18",
         {{"ptp.v2.mm.parentclockidentity", "0x0102030405060708"},
          {"ptp.v2.mm.parentsourceportid", "3"},
          {"ptp.v2.mm.parentstats", "1"},
          {"ptp.v2.mm.observedParentOffsetScaledLogVariance", "4660"},
          {"ptp.v2.mm.observedParentClockPhaseChangeRate", "-2"},
          {"ptp.v2.mm.grandmasterPriority1", "10"},
          {"ptp.v2.mm.grandmasterclockclass", "13"},
          {"ptp.v2.mm.grandmasterclockaccuracy", "0x22"},
          {"ptp.v2.mm.grandmasterclockvariance", "22136"},
          {"ptp.v2.mm.grandmasterPriority2", "11"},
          {"ptp.v2.mm.grandmasterclockidentity", "0x1112131415161718"}}},
        {"TIME_PROPERTIES_DATA_SET",
         "00 01 00 06 20 03 | 00 25 | 2D | 20",
         {{"ptp.v2.mm.currentutcoffset", "37"},
          {"ptp.v2.mm.li61", "1"},
          {"ptp.v2.mm.li59", "0"},
          {"ptp.v2.mm.CurrentUTCOffsetValid", "1"},
          {"ptp.v2.mm.ptptimescale", "1"},
          {"ptp.v2.mm.timeTraceable", "0"},
          {"ptp.v2.mm.frequencyTraceable", "1"},
          {"ptp.v2.mm.timesource", "0x20"}}},
        {"PORT_DATA_SET",
         "00 01 00 1C 20 04 | 02 00 00 FF FE 00 00 01 00 02 | 06 | FD |"
         "00 00 00 00 00 07 00 00 | FE | 03 | FF | 02 | 01 | 02",
         {{"ptp.v2.mm.clockidentity", "0x020000fffe000001"},
          {"ptp.v2.mm.PortNumber", "2"},
          {"ptp.v2.mm.portState", "6"},
          {"ptp.v2.mm.logMinDelayReqInterval", "-3"},
          {"ptp.v2.mm.peerMeanPathDelay.ns", "7"},
          {"ptp.v2.mm.logAnnounceInterval", "-2"},
          {"ptp.v2.mm.announceReceiptTimeout", "3"},
          {"ptp.v2.mm.logSyncInterval", "-1"},
          {"ptp.v2.mm.delayMechanism", "2"},
          {"ptp.v2.mm.logMinPdelayReqInterval", "1"},
          {"ptp.v2.mm.versionNumber", "2"}}},
        {"PRIORITY1", "00 01 00 04 20 05 | C8 | 00", {{"ptp.v2.mm.priority1", "200"}}},
        {"PRIORITY2", "00 01 00 04 20 06 | 05 | 00", {{"ptp.v2.mm.priority2", "5"}}},
        {"DOMAIN", "00 01 00 04 20 07 | 03 | 00", {{"ptp.v2.mm.domainNumber", "3"}}},
        {"SLAVE_ONLY", "00 01 00 04 20 08 | 01 | 00", {{"ptp.v2.mm.SlavOnly", "1"}}},
        {"LOG_ANNOUNCE_INTERVAL",
         "00 01 00 04 20 09 | FE | 00",
         {{"ptp.v2.mm.logAnnounceInterval", "-2"}}},
        {"ANNOUNCE_RECEIPT_TIMEOUT",
         "00 01 00 04 20 0A | 06 | 00",
         {{"ptp.v2.mm.announceReceiptTimeout", "6"}}},
        {"LOG_SYNC_INTERVAL", "00 01 00 04 20 0B | FF | 00", {{"ptp.v2.mm.logSyncInterval", "-1"}}},
        {"VERSION_NUMBER", "00 01 00 04 20 0C | 02 | 00", {{"ptp.v2.mm.versionNumber", "2"}}},
        {"ENABLE_PORT", "00 01 00 02 20 0D", {{"ptp.v2.mm.managementId", "8205"}}},
        {"DISABLE_PORT", "00 01 00 02 20 0E", {{"ptp.v2.mm.managementId", "8206"}}},
        {"TIME",
         "00 01 00 0C 20 0F | 00 00 6B 15 50 3A | 3B 5B 2B 0B",
         {{"ptp.v2.mm.currentTime.seconds", "1796558906"},
          {"ptp.v2.mm.currentTime.nanoseconds", "995830539"}}},
        {"CLOCK_ACCURACY", "00 01 00 04 20 10 | 23 | 00", {{"ptp.v2.mm.clockaccuracy", "0x23"}}},
        {"UTC_PROPERTIES",
         "00 01 00 06 20 11 | 00 25 | 05 | 00",
         {{"ptp.v2.mm.currentutcoffset", "37"},
          {"ptp.v2.mm.li61", "1"},
          {"ptp.v2.mm.li59", "0"},
          {"ptp.v2.mm.CurrentUTCOffsetValid", "1"}}},
        {"TRACEABILITY_PROPERTIES",
         "00 01 00 04 20 12 | 20 | 00",
         {{"ptp.v2.mm.timeTraceable", "0"}, {"ptp.v2.mm.frequencyTraceable", "1"}}},
        {"TIMESCALE_PROPERTIES",
         "00 01 00 04 20 13 | 08 | 40",
         {{"ptp.v2.mm.ptptimescale", "1"}, {"ptp.v2.mm.timesource", "0x40"}}},
        {"DELAY_MECHANISM", "00 01 00 04 60 00 | 02 | 00", {{"ptp.v2.mm.delayMechanism", "2"}}},
        {"LOG_MIN_PDELAY_REQ_INTERVAL",
         "00 01 00 04 60 01 | FC | 00",
         {{"ptp.v2.mm.logMinPdelayReqInterval", "-4"}}},
    };
    return table;
}

class TlvTsharkAgreementTest : public ::testing::TestWithParam<Case> {
  protected:
    void SetUp() override { QV_REQUIRE_TSHARK(); }
};

TEST_P(TlvTsharkAgreementTest, RequestAndResponseDecodeToOurValues) {
    const Case& c = GetParam();
    const auto received = qvtest::hexOctets(c.octets);
    const std::uint16_t id = static_cast<std::uint16_t>(received[4] << 8 | received[5]);
    const tManagementIdEntry* row = findManagementId(id);
    ASSERT_NE(row, nullptr);
    auto tlv = row->create();
    qvtest::Datagram datagram(c.octets);
    tStatus status;
    tlv->deserialize(datagram.unit(), status);
    ASSERT_TRUE(status.succeeded()) << status.code;
    const std::string ours = qvtest::encode(*tlv);
    EXPECT_EQ(ours, qvtest::hex(c.octets));

    for (std::uint8_t action : {std::uint8_t{0}, std::uint8_t{2}}) {
        SCOPED_TRACE(action == 0 ? "GET" : "RESPONSE");
        const qvtest::TsharkDecode decoded(managementAround(ours, action));
        EXPECT_EQ(decoded.show("ptp.v2.mm.action"), std::to_string(action));
        EXPECT_EQ(decoded.show("ptp.v2.mm.managementId"), std::to_string(id));
        EXPECT_EQ(decoded.show("ptp.v2.mm.lengthField"), std::to_string(tlv->getLengthField()));
        for (const auto& [field, value] : c.shown) {
            EXPECT_EQ(decoded.show(field), value) << field;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(EveryManagementId, TlvTsharkAgreementTest, ::testing::ValuesIn(cases()),
                         [](const auto& param) { return std::string(param.param.name); });

TEST(TlvTsharkTableTest, EveryIdOfTheTableHasACase) {
    EXPECT_EQ(cases().size(), managementIdTable().size());
}

}  // namespace
