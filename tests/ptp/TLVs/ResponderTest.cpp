#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "ptp/TLVs/tClockAccuracyTLV.h"
#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tDelayMechanismTLV.h"
#include "ptp/TLVs/tDisablePortTLV.h"
#include "ptp/TLVs/tEnablePortTLV.h"
#include "ptp/TLVs/tFaultLogResetTLV.h"
#include "ptp/TLVs/tFaultLogTLV.h"
#include "ptp/TLVs/tInitializeTLV.h"
#include "ptp/TLVs/tLogSyncIntervalTLV.h"
#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tPriority2TLV.h"
#include "ptp/TLVs/tSaveInNonVolatileStorageTLV.h"
#include "ptp/TLVs/tSlaveOnlyTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tTimescalePropertiesTLV.h"
#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "ptp/tManagementIdTable.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/support/ptp/InMemoryManagedClock.h"

using namespace nQVPTP000;
using Answer = std::unique_ptr<tManagementMessagePayload>;
using Error = tManagementErrorStatusTLV;
using qvtest::Datagram;

namespace {

constexpr std::uint32_t kGet = tManagementMessagePayload::kGet;
constexpr std::uint32_t kSet = tManagementMessagePayload::kSet;
constexpr std::uint32_t kCommand = tManagementMessagePayload::kCommand;

class ResponderTest : public ::testing::Test {
  protected:
    Answer ask(tManagementMessagePayload& request, std::uint32_t action, std::uint16_t port = 1) {
        tStatus status;
        Answer answer = request.respond(action, clock, port, status);
        EXPECT_TRUE(status.succeeded());
        return answer;
    }
    // "errorId text" of an error answer, "" for a TLV answer.
    static std::string refusal(const Answer& answer) {
        const auto* error = dynamic_cast<const Error*>(answer.get());
        if (error == nullptr) {
            return "";
        }
        return std::to_string(error->getManagementErrorId()) + " " +
               std::string(error->getDisplayData().view());
    }
    template <typename T>
    static const T& as(const Answer& answer) {
        const auto* tlv = dynamic_cast<const T*>(answer.get());
        EXPECT_NE(tlv, nullptr);
        return *tlv;
    }

    qvtest::InMemoryManagedClock clock{2};
    const std::string generalGet = std::to_string(Error::kGeneralError) + " Failure getting value";
    const std::string generalSet = std::to_string(Error::kGeneralError) + " Failure setting value";
    const std::string unsupported =
        std::to_string(Error::kNotSupported) + " Unsupported actionField";
};

TEST_F(ResponderTest, DataSetGetsFillFromTheClock) {
    clock.defaultDataSet.priority1 = 7;
    clock.defaultDataSet.twoStepFlag = true;
    clock.parentDataSet.grandmasterPriority2 = 9;
    clock.port(2).logSyncInterval = -3;
    clock.port(2).versionNumber = 2;

    tDefaultDataSetTLV defaults;
    const Answer a = ask(defaults, kGet);
    EXPECT_EQ(as<tDefaultDataSetTLV>(a).getPriority1(), 7);
    EXPECT_TRUE(as<tDefaultDataSetTLV>(a).getTwoStepFlag());
    EXPECT_EQ(as<tDefaultDataSetTLV>(a).getNumberPorts(), 2);

    tParentDataSetTLV parent;
    EXPECT_EQ(as<tParentDataSetTLV>(ask(parent, kGet)).getGrandmasterPriority2(), 9);

    tPortDataSetTLV port;
    const Answer p = ask(port, kGet, 2);
    EXPECT_EQ(as<tPortDataSetTLV>(p).getLogSyncInterval(), -3);
    EXPECT_EQ(as<tPortDataSetTLV>(p).getPortIdentity().getPortNumber(), 2);
    // A data set cannot be set as a whole.
    EXPECT_EQ(refusal(ask(port, kSet)), unsupported);
}

TEST_F(ResponderTest, ClockDescriptionGetCopiesTheAddressAndPads) {
    tStatus status;
    clock.port(1).physicalAddress = {2, 0, 0, 0, 0, 1};
    clock.port(1).physicalLayerProtocol = tPTPText("IEEE 802.3", status);
    clock.userDescription = tPTPText("alpha", status);
    tClockDescriptionTLV tlv;
    const Answer answer = ask(tlv, kGet);
    const auto& description = as<tClockDescriptionTLV>(answer);
    EXPECT_TRUE(description.getOrdinaryClock());
    ASSERT_EQ(description.getPhysicalAddressLength(), 6);
    EXPECT_NE(description.getPhysicalAddress().data(), clock.port(1).physicalAddress.data());
    // 14 + 11 + 6 + 4 + 1 + 1 + 6 = 43 octets: odd, so padded; + managementId = 46
    EXPECT_TRUE(description.getPadNeeded());
    EXPECT_EQ(description.getLengthField(), 46);
    EXPECT_EQ(description.getUserDescription().view(), "alpha");
    // A port the clock does not have.
    EXPECT_EQ(refusal(ask(tlv, kGet, 3)), generalGet);
}

TEST_F(ResponderTest, EveryGetOfAFailingClockIsAGeneralError) {
    clock.failures.getters = true;
    for (const tManagementIdEntry& row : managementIdTable()) {
        auto tlv = row.create();
        const std::string answer = refusal(ask(*tlv, kGet));
        switch (row.managementId) {
            case kNullManagement:
            case kFaultLog:  // answered with an empty log without asking the clock
                EXPECT_EQ(answer, "") << row.name;
                break;
            case kSaveInNonVolatileStorage:
            case kResetNonVolatileStorage:
            case kInitialize:
            case kFaultLogReset:
            case kEnablePort:
            case kDisablePort:
                EXPECT_EQ(answer, unsupported) << row.name;
                break;
            default:
                EXPECT_EQ(answer, generalGet) << row.name;
        }
    }
}

TEST_F(ResponderTest, SingleValueSetsApplyOrRefuse) {
    tStatus status;
    tPriority2TLV priority2;
    priority2.setValue(33, status);
    EXPECT_EQ(refusal(ask(priority2, kSet)), "");
    EXPECT_EQ(clock.defaultDataSet.priority2, 33);

    tSlaveOnlyTLV slaveOnly;
    slaveOnly.setValue(true, status);
    ask(slaveOnly, kSet);
    EXPECT_TRUE(clock.defaultDataSet.slaveOnly);

    tLogSyncIntervalTLV sync;
    sync.setValue(-2, status);
    ask(sync, kSet, 2);
    EXPECT_EQ(clock.port(2).logSyncInterval, -2);
    EXPECT_EQ(clock.port(1).logSyncInterval, 0);
    EXPECT_EQ(as<tLogSyncIntervalTLV>(ask(sync, kGet, 2)).getValue(), -2);

    tClockAccuracyTLV accuracy;
    accuracy.setValue(0x1F, status);
    EXPECT_EQ(refusal(ask(accuracy, kSet)), "4 Unsupported clockAccuracy value");
    EXPECT_EQ(clock.defaultDataSet.clockQuality.clockAccuracy, 0xFEU);
    accuracy.setValue(0x31, status);
    ask(accuracy, kSet);
    EXPECT_EQ(clock.defaultDataSet.clockQuality.clockAccuracy, 0x31U);

    tDelayMechanismTLV delay;
    delay.setValue(3, status);
    EXPECT_EQ(refusal(ask(delay, kSet)), "4 Unsupported delayMechanism value");
    EXPECT_EQ(clock.port(1).delayMechanism, 1);
    delay.setValue(0xFE, status);
    ask(delay, kSet);
    EXPECT_EQ(clock.port(1).delayMechanism, 0xFE);

    clock.failures.setters = true;
    EXPECT_EQ(refusal(ask(priority2, kSet)), generalSet);
    EXPECT_EQ(refusal(ask(sync, kSet)), generalSet);
    EXPECT_EQ(refusal(ask(priority2, kCommand)), unsupported);
}

TEST_F(ResponderTest, PropertySets) {
    Datagram utcOctets("00 01 00 06 20 11 | FF FF | 05 | 00");  // -1, UTCV and LI61
    tUTCPropertiesTLV utc;
    tStatus status;
    utc.deserialize(utcOctets.unit(), status);
    ask(utc, kSet);
    EXPECT_EQ(clock.timeProperties.currentUtcOffset, -1);
    EXPECT_TRUE(clock.timeProperties.currentUtcOffsetValid);
    EXPECT_FALSE(clock.timeProperties.leap59);
    EXPECT_TRUE(clock.timeProperties.leap61);

    Datagram traceOctets("00 01 00 04 20 12 | 10 | 00");  // time traceable only
    tTraceabilityPropertiesTLV traceability;
    traceability.deserialize(traceOctets.unit(), status);
    ask(traceability, kSet);
    EXPECT_TRUE(clock.timeProperties.timeTraceable);
    EXPECT_FALSE(clock.timeProperties.frequencyTraceable);

    // An unknown time source is refused, but ptpTimescale is applied all the same, and the
    // refusal wins over a failing clock.
    Datagram scaleOctets("00 01 00 04 20 13 | 00 | 11");
    tTimescalePropertiesTLV timescale;
    timescale.deserialize(scaleOctets.unit(), status);
    EXPECT_EQ(refusal(ask(timescale, kSet)), "4 Unknown timeSource value");
    EXPECT_FALSE(clock.timeProperties.ptpTimescale);
    EXPECT_EQ(clock.timeProperties.timeSource, 0xA0);
    clock.failures.setters = true;
    EXPECT_EQ(refusal(ask(timescale, kSet)), "4 Unknown timeSource value");
    EXPECT_EQ(refusal(ask(utc, kSet)), generalSet);
}

TEST_F(ResponderTest, TimeIsSetOnlyOnAGrandmaster) {
    tStatus status;
    tTimeTLV time;
    time.setCurrentTime(tTimestamp(1000, 5), status);
    ask(time, kSet);
    EXPECT_EQ(clock.time, tTimestamp(1000, 5));
    EXPECT_EQ(as<tTimeTLV>(ask(time, kGet)).getCurrentTime(), tTimestamp(1000, 5));

    const std::uint8_t other[8] = {9, 9, 9, 9, 9, 9, 9, 9};
    clock.parentDataSet.grandmasterIdentity = tClockIdentity(other);
    time.setCurrentTime(tTimestamp(2000, 0), status);
    EXPECT_EQ(refusal(ask(time, kSet)), "6 Cannot set time on non-grandmaster clock");
    EXPECT_EQ(clock.time, tTimestamp(1000, 5));
}

TEST_F(ResponderTest, UserDescriptionSetAndGet) {
    tStatus status;
    tUserDescriptionTLV tlv;
    tlv.setUserDescription(tPTPText("rack 4", status), status);
    ask(tlv, kSet);
    EXPECT_EQ(clock.userDescription.view(), "rack 4");
    tUserDescriptionTLV empty;
    const Answer answer = ask(empty, kGet);
    EXPECT_EQ(as<tUserDescriptionTLV>(answer).getUserDescription().view(), "rack 4");
    EXPECT_EQ(as<tUserDescriptionTLV>(answer).getLengthField(), 10);  // 2 + 7 + pad
    clock.failures.setters = true;
    EXPECT_EQ(refusal(ask(tlv, kSet)), generalSet);
}

TEST_F(ResponderTest, Commands) {
    tDisablePortTLV disable;
    EXPECT_EQ(refusal(ask(disable, kCommand, 2)), "");
    EXPECT_FALSE(clock.port(2).enabled);
    tEnablePortTLV enable;
    ask(enable, kCommand, 2);
    EXPECT_TRUE(clock.port(2).enabled);
    EXPECT_EQ(refusal(ask(enable, kGet)), unsupported);

    tInitializeTLV initialize;
    ask(initialize, kCommand, 1);
    EXPECT_EQ(clock.port(1).initializations, 1U);
    tInitializeTLV unknownKey(0x1234);
    EXPECT_EQ(refusal(ask(unknownKey, kCommand)), "4 Unknown initialization key value");
    EXPECT_EQ(clock.port(1).initializations, 1U);

    tSaveInNonVolatileStorageTLV save;
    EXPECT_EQ(refusal(ask(save, kCommand)), "6 Non-volatile storage is currently unsupported");
    tFaultLogResetTLV reset;
    EXPECT_EQ(as<tFaultLogResetTLV>(ask(reset, kCommand)).getManagementId(), kFaultLogReset);

    clock.failures.commands = true;
    const std::string general = std::to_string(Error::kGeneralError);
    EXPECT_EQ(refusal(ask(enable, kCommand)), general + " Failure enabling port");
    EXPECT_EQ(refusal(ask(disable, kCommand)), general + " Failure disabling port");
    EXPECT_EQ(refusal(ask(initialize, kCommand)), general + " Node failed to initialize");
}

TEST_F(ResponderTest, FaultLogAnswersEmpty) {
    Datagram octets(
        "00 01 00 14 00 06 | 00 01 | 00 0E | 00 00 00 00 00 05 00 00 00 07 | 07 |"
        "00 00 00");
    tFaultLogTLV log;
    tStatus status;
    log.deserialize(octets.unit(), status);
    const Answer answer = ask(log, kGet);
    EXPECT_EQ(as<tFaultLogTLV>(answer).getNumberOfFaultRecords(), 0);
    EXPECT_EQ(as<tFaultLogTLV>(answer).getLengthField(), 4);
}

TEST_F(ResponderTest, AStatusInErrorGetsNoAnswer) {
    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    for (const tManagementIdEntry& row : managementIdTable()) {
        auto tlv = row.create();
        for (std::uint32_t action : {kGet, kSet, kCommand}) {
            EXPECT_EQ(tlv->respond(action, clock, 1, failed), nullptr) << row.name;
        }
    }
}

}  // namespace
