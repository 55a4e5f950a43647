#include <gtest/gtest.h>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/tManagementIdTable.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/support/ptp/InMemoryManagedClock.h"

// The answers of the management TLVs to requests against a clock. The client's tests drive
// the common reads and writes through a simulated clock; these rows hold what the client
// cannot see: the octets of answers, the error ids and texts of refusals, and the clock's
// failures. Rows run in order against one clock with two ports, so a SET shows in a later GET.

using namespace nQVPTP000;
using Clock = qvtest::InMemoryManagedClock;

namespace {

constexpr std::uint32_t kGet = tManagementMessagePayload::kGet;
constexpr std::uint32_t kSet = tManagementMessagePayload::kSet;
constexpr std::uint32_t kCommand = tManagementMessagePayload::kCommand;

struct Row {
    const char* name;
    std::uint32_t action;
    std::uint16_t port;
    const char* request;  // the TLV, tlvType onward
    const char* answer;   // the answer's octets, or "error ID TEXT" for an error status
    void (*prepare)(Clock&) = nullptr;
};

std::string answerText(const tManagementMessagePayload& answer) {
    const auto* error = dynamic_cast<const tManagementErrorStatusTLV*>(&answer);
    if (error == nullptr) {
        return qvtest::encode(answer);
    }
    return "error " + std::to_string(error->getManagementErrorId()) + " " +
           std::string(error->getDisplayData().view());
}

// The client's tests set and read single values, times, properties and descriptions; these
// rows keep the octets of whole data sets, which the client only sees through getters, and
// the refusals.
void setUp(Clock& c) {
    tStatus status;
    c.defaultDataSet = {false, true, 0xC8, 0x21, 5, {}, c.defaultDataSet.clockIdentity};
    c.defaultDataSet.clockQuality.clockAccuracy = 0x31;
    c.timeProperties = {-1, true, false, true, true, false, true, 0xA0};
    c.userDescription = tPTPText("rack4", status);
    c.port(1).physicalLayerProtocol = tPTPText("IEEE 802.3", status);
    c.port(1).physicalAddress = {2, 0, 0, 0, 0, 1};
    c.port(2).logSyncInterval = -2;
}

// What a TLV writes is as long as its lengthField says, and even.
void expectWhole(const tTLV& tlv) {
    const std::size_t written = qvtest::hexOctets(qvtest::encode(tlv)).size();
    EXPECT_EQ(written, tlv.getLengthField() + 4U);
    EXPECT_EQ(written % 2, 0U);
}

const Row kRows[] = {
    {"SET CLOCK_ACCURACY reserved", kSet, 1, "00 01 00 04 20 10 | 1F | 00",
     "error 4 Unsupported clockAccuracy value", setUp},
    // slaveOnly | numberPorts 2 | priority1 | quality | priority2 | identity | domain
    {"GET DEFAULT_DATA_SET", kGet, 1, "00 01 00 02 20 00",
     "00 01 00 16 20 00 02 00 00 02 C8 BB 31 FF FF 21 02 00 00 FF FE 00 00 01 05 00"},
    {"SET DELAY_MECHANISM disabled", kSet, 2, "00 01 00 04 60 00 | FE | 00",
     "00 01 00 04 60 00 FE 00"},
    // identity:2 | state 1 | logMinDelayReqInterval 0 | peerMeanPathDelay 0 | announce 1,
    // timeout 3 | logSyncInterval -2 | delayMechanism FE | logMinPdelayReqInterval 0 | v2
    {"GET PORT_DATA_SET port 2", kGet, 2, "00 01 00 02 20 04",
     "00 01 00 1C 20 04 02 00 00 FF FE 00 00 01 00 02 01 00 00 00 00 00 00 00 00 00 01 03 FE FE 00 "
     "02"},
    {"GET PORT_DATA_SET of a port the clock lacks", kGet, 3, "00 01 00 02 20 04",
     "error 65534 Failure getting value"},
    // An unknown time source is refused, and ptpTimescale is applied all the same.
    {"SET TIMESCALE_PROPERTIES unknown source", kSet, 1, "00 01 00 04 20 13 | 00 | 11",
     "error 4 Unknown timeSource value"},
    {"GET TIME_PROPERTIES_DATA_SET", kGet, 1, "00 01 00 02 20 03", "00 01 00 06 20 03 FF FF 15 A0"},
    {"SET TIME on a clock that is not grandmaster", kSet, 1,
     "00 01 00 0C 20 0F | 00 00 00 00 07 D0 | 00 00 00 00",
     "error 6 Cannot set time on non-grandmaster clock",
     [](Clock& c) { c.parentDataSet.grandmasterIdentity = allOnesClockIdentity(); }},
    // clockType OC | "IEEE 802.3" | physical address | protocol address of no protocol |
    // manufacturer | reserved | product | revision | "rack4" | profile | pad
    {"GET CLOCK_DESCRIPTION", kGet, 1, "00 01 00 02 00 01",
     "00 01 00 2E 00 01 80 00 0A 49 45 45 45 20 38 30 32 2E 33 00 06 02 00 00 00 00 01 FF FE 00 00 "
     "00 00 00 00 00 00 05 72 61 63 6B 34 00 00 00 00 00 00 00"},
    {"COMMAND SAVE_IN_NON_VOLATILE_STORAGE", kCommand, 1, "00 01 00 02 00 03",
     "error 6 Non-volatile storage is currently unsupported"},
    {"COMMAND PRIORITY2", kCommand, 1, "00 01 00 04 20 06 | 21 | 00",
     "error 6 Unsupported actionField"},
    // The clock fails every set and command from here on.
    {"SET PRIORITY2 failing", kSet, 1, "00 01 00 04 20 06 | 22 | 00",
     "error 65534 Failure setting value",
     [](Clock& c) { c.failures.setters = c.failures.commands = true; }},
    {"COMMAND ENABLE_PORT failing", kCommand, 1, "00 01 00 02 20 0D",
     "error 65534 Failure enabling port"},
    {"COMMAND INITIALIZE failing", kCommand, 1, "00 01 00 04 00 05 | 00 00",
     "error 65534 Node failed to initialize"},
};

TEST(ResponderTest, AnswersInOrderAgainstOneClock) {
    Clock clock(2);
    for (const Row& row : kRows) {
        SCOPED_TRACE(row.name);
        if (row.prepare != nullptr) {
            row.prepare(clock);
        }
        // A request without its data field is the table's default object, as the client
        // sends a GET.
        const auto octets = qvtest::hexOctets(row.request);
        auto request =
            findManagementId(static_cast<std::uint16_t>(octets[4] << 8 | octets[5]))->create();
        tStatus status;
        if (octets.size() > 6) {
            qvtest::Datagram datagram(row.request);
            request->deserialize(datagram.unit(), status);
        }
        const auto answer = request->respond(row.action, clock, row.port, status);
        ASSERT_TRUE(status.succeeded()) << status.code;
        ASSERT_NE(answer, nullptr);
        EXPECT_EQ(answerText(*answer), row.answer);
        expectWhole(*answer);
    }
    EXPECT_EQ(clock.defaultDataSet.priority2, 0x21);
}

TEST(ResponderTest, EveryGetOfAFailingClockIsAGeneralError) {
    Clock clock;
    clock.failures.getters = true;
    for (const tManagementIdEntry& row : managementIdTable()) {
        SCOPED_TRACE(row.name);
        tStatus status;
        const auto answer = row.create()->respond(kGet, clock, 1, status);
        ASSERT_NE(answer, nullptr);
        expectWhole(*row.create());
        expectWhole(*answer);
        const std::string text = answerText(*answer);
        if (row.managementId == kNullManagement || row.managementId == kFaultLog) {
            EXPECT_EQ(text.find("error"), std::string::npos);    // the clock is not asked
        } else if (text != "error 6 Unsupported actionField") {  // commands
            EXPECT_EQ(text, "error 65534 Failure getting value");
        }
    }
}

}  // namespace
