#include <gtest/gtest.h>

#include "ptp/tAnnounceMessage.h"
#include "ptp/tDelayReqMessage.h"
#include "ptp/tFollowUpMessage.h"
#include "ptp/tSignalingMessage.h"
#include "tests/ptp/MessageTestSupport.h"

using namespace nQVPTP000;
using qvtest::decodeMessage;
using qvtest::headerHex;

namespace {

constexpr const char* kAnnounceBody =
    "00 00 00 00 00 00 | 00 00 00 00 |"  // originTimestamp
    "00 25 | 00 |"                       // currentUtcOffset 37 | reserved
    "80 |"                               // grandmasterPriority1 128
    "06 21 4E 5D |"                      // clockClass 6, accuracy 0x21, variance 0x4E5D
    "80 |"                               // grandmasterPriority2 128
    "00 1B 21 FF FE 01 02 03 |"          // grandmasterIdentity
    "00 00 |"                            // stepsRemoved 0
    "20";                                // timeSource GPS

TEST(tAnnounceMessageTest, CutAfterFiftyOctets) {
    const std::string whole = qvtest::hex(headerHex("0B", "00 40", "05") + kAnnounceBody);
    tStatus status;
    EXPECT_EQ(decodeMessage(whole.substr(0, 50 * 3), status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tAnnounceMessageTest, TraceShowsTheOffsetSignExtended) {
    std::string body = kAnnounceBody;
    body.replace(body.find("00 25"), 5, "FF FF");  // currentUtcOffset -1
    tStatus status;
    const auto message = decodeMessage(headerHex("0B", "00 40", "05") + body, status);
    ASSERT_NE(message, nullptr);
    const std::string text = qvtest::traceText(*message);
    const std::string headerEnd = "--- End Message Header ---\n";
    EXPECT_EQ(text.substr(text.find(headerEnd) + headerEnd.size()),
              "originTimestamp: secondsField: 0 nanosecondsField: 0\n"
              "currentUTCOffset: 4294967295\n"
              "timeSource: 32\n"
              "stepsRemoved: 0\n"
              "grandmasterIdentity: 001b21fffe010203\n"
              "grandmasterClockQuality: clockClass: 6 clockAccuracy: 0x21 "
              "offsetScaledLogVariance: 0x4e5d\n"
              "grandmasterPriority1: 128\n"
              "grandmasterPriority2: 128\n"
              "--- End Announce Message ---\n");
}

TEST(tEventMessagesTest, EachTypeGetsItsClassAndDump) {
    const std::string timestamp = "00 00 00 00 00 01 | 00 00 00 02";
    struct Case {
        const char* type;
        const char* control;
        const char* begin;
    };
    const Case cases[] = {
        {"01", "01", "--- Begin Delay_Req Message ---\n"},
        {"08", "02", "--- Begin Follow_Up Message ---\n"},
        {"0C", "05", "--- Begin Signaling Message ---\n"},
    };
    for (const Case& c : cases) {
        tStatus status;
        const auto message =
            decodeMessage(headerHex(c.type, "00 2C", c.control) + timestamp, status);
        ASSERT_NE(message, nullptr) << c.type;
        EXPECT_EQ(message->getSize(), 44);
        EXPECT_EQ(qvtest::traceText(*message).rfind(c.begin, 0), 0U) << c.type;
    }
    tStatus status;
    const auto followUp = decodeMessage(headerHex("08", "00 2C", "02") + timestamp, status);
    EXPECT_EQ(dynamic_cast<const tFollowUpMessage&>(*followUp).getPreciseOriginTimestamp(),
              tTimestamp(1, 2));
}

}  // namespace
