#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <typeinfo>

#include "ptp/tManagementMessage.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/ptp/FieldsAsTshark.h"

// Datagrams of real peers (tests/data/corpus) and datagrams laid out by hand from the
// standard: tshark and the codec must agree on every field, and whatever the codec decodes
// it writes back octet for octet, so the encoder is held to the same octets. One tshark run
// per test.

using namespace nQVPTP000;

namespace {

struct Sample {
    std::string name;
    std::vector<std::uint8_t> octets;
    std::unique_ptr<tPTPMessage> message;   // decoded from the octets
    std::vector<std::uint8_t> writtenBack;  // what the codec writes after decoding the octets
};

Sample received(std::string name, std::vector<std::uint8_t> octets) {
    tStatus status;
    auto message = qvtest::decodeMessage(qvtest::hexText(octets), status);
    EXPECT_TRUE(status.succeeded()) << name << ": " << status.code;
    return {std::move(name), octets, std::move(message), octets};
}

void expectSameFields(const qvtest::TsharkFields& ours, const qvtest::TsharkFields& tshark) {
    std::map<std::string, std::size_t> seen;
    for (const auto& [name, shown] : tshark) {
        EXPECT_NE(name, "_ws.malformed") << "tshark finds the datagram malformed";
        std::size_t occurrence = seen[name]++;
        const auto our = std::find_if(ours.begin(), ours.end(), [&](const auto& field) {
            return field.first == name && occurrence-- == 0;
        });
        if (our != ours.end()) {
            EXPECT_EQ(qvtest::comparable(our->second), qvtest::comparable(shown)) << name;
        }
    }
    for (const auto& [name, value] : ours) {
        EXPECT_GT(seen[name], 0U) << "tshark does not show " << name;
    }
}

// Each sample's length, round trip and copies, and its fields as tshark decodes them.
void expectAgreement(const std::vector<Sample>& samples) {
    std::vector<std::vector<std::uint8_t>> datagrams;
    for (const Sample& sample : samples) {
        datagrams.push_back(sample.octets);
    }
    const auto decoded = qvtest::tsharkDecode(datagrams);
    ASSERT_EQ(decoded.size(), samples.size());
    for (std::size_t i = 0; i < samples.size(); ++i) {
        const Sample& sample = samples[i];
        SCOPED_TRACE(sample.name);
        ASSERT_NE(sample.message, nullptr);
        EXPECT_EQ(sample.message->getHeader()->getMessageLength(), sample.octets.size());
        tStatus status;
        const auto again = qvtest::decodeMessage(qvtest::hexText(sample.octets), status);
        ASSERT_NE(again, nullptr);
        EXPECT_EQ(qvtest::encode(*again), qvtest::hexText(sample.writtenBack));
        expectSameFields(qvtest::fieldsAsTshark(*sample.message), decoded[i]);
        for (std::size_t t = 0; t < again->getSuffix()->getCount(); ++t) {
            const tTLV& tlv = *again->getSuffix()->getTLV(t, status);
            const auto copy = tlv.clone(status);
            ASSERT_NE(copy, nullptr);
            const tTLV& copied = *copy;
            EXPECT_EQ(typeid(copied), typeid(tlv));
            EXPECT_EQ(qvtest::encode(copied), qvtest::encode(tlv));
        }
    }
}

TEST(TsharkAgreementTest, RealPeersDatagrams) {
    QV_REQUIRE_TSHARK();
    // Reserved octets that these peers fill: the codec writes them as zero.
    const std::map<std::string, std::size_t> reserved = {{"pmc-set-priority1", 55},
                                                         {"ptpd-announce", 46}};
    std::vector<Sample> samples;
    const auto folder = std::filesystem::path(QV_TEST_DATA_DIR) / "corpus";
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
        if (entry.path().extension() == ".hex") {
            std::stringstream text;
            text << std::ifstream(entry.path()).rdbuf();
            samples.push_back(
                received(entry.path().stem().string(), qvtest::hexOctets(text.str())));
            if (const auto at = reserved.find(samples.back().name); at != reserved.end()) {
                samples.back().writtenBack.at(at->second) = 0;
            }
        }
    }
    EXPECT_GE(samples.size(), 90U);
    expectAgreement(samples);
}

// A RESPONSE around one management TLV (tlvType onward): source 020000.fffe.000001-1,
// sequence 7, target 025156.fffe.000001-1, startingBoundaryHops 3, boundaryHops 1.
std::vector<std::uint8_t> response(const std::string& tlv) {
    auto octets = qvtest::hexOctets(
        "0D 02 00 00 | 05 | 00 | 00 00 | 00 00 00 00 00 00 00 00 | 00 00 00 00 |"
        "02 00 00 FF FE 00 00 01 | 00 01 | 00 07 | 04 | 7F |"
        "02 51 56 FF FE 00 00 01 | 00 01 | 03 | 01 | 02 | 00 |" +
        tlv);
    octets[3] = static_cast<std::uint8_t>(octets.size());
    return octets;
}

// The TLVs the peers' datagrams lack or hold only with default values, laid out from the
// standard, and messages of the other types with every header field in use.
TEST(TsharkAgreementTest, DatagramsFromTheStandard) {
    QV_REQUIRE_TSHARK();
    const std::pair<const char*, const char*> tlvs[] = {
        {"RESET_NON_VOLATILE_STORAGE", "00 01 00 02 00 04"},
        {"INITIALIZE", "00 01 00 04 00 05 | 12 34"},
        {"FAULT_LOG",
         "00 01 00 1A 00 06 | 00 01 | 00 13 | 00 00 00 00 00 05 00 00 00 07 | 03 |"
         "01 61 | 02 62 63 | 02 64 65 | 00"},
        {"CURRENT_DATA_SET",
         "00 01 00 14 20 01 | 00 02 | FF FF FF FF FF FD 80 00 | 00 00 00 00 00 0A 00 01"},
        {"TIME", "00 01 00 0C 20 0F | 00 00 6B 15 50 3A | 3B 5B 2B 0B"},
        // NOT_SUPPORTED for PRIORITY1, with a display text of odd size.
        {"MANAGEMENT_ERROR_STATUS", "00 02 00 0C 00 06 | 20 05 | 00 00 00 00 | 03 61 62 63"},
    };
    std::vector<Sample> samples;
    for (const auto& [name, tlv] : tlvs) {
        samples.push_back(received(name, response(tlv)));
    }
    // transportSpecific 1, domain 5, correction 3 ns + 4/65536, sequence 0x0102,
    // logMessageInterval -2. The flags of the four messages give each flag a pattern of its
    // own, so that no two flags can trade places unseen.
    auto header = [](const char* type, const char* length, const char* control, const char* flags) {
        return std::string(type) + " 02 " + length + " | 05 | 00 | " + flags +
               " | 00 00 00 00 00 03 00 04 | 00 00 00 00 | 00 1B 21 FF FE 01 02 03 | 00 01 |"
               "01 02 |" +
               control + " | FE |";
    };
    // currentUtcOffset -2, grandmaster 0x06 0x21 0x4E5D priority 128 and 127, GPS.
    samples.push_back(received(
        "Announce", qvtest::hexOctets(header("1B", "00 40", "05", "A2 2A") +
                                      "00 00 00 00 00 09 | 00 00 00 0A | FF FE | 00 | 80 |"
                                      "06 21 4E 5D | 7F | 00 1B 21 FF FE 0A 0B 0C | 00 03 | 20")));
    // Seconds past 2^32 and the largest nanoseconds.
    const std::string timestamp = "00 01 02 03 04 05 | 3B 9A C9 FF";
    samples.push_back(
        received("Sync", qvtest::hexOctets(header("10", "00 2C", "00", "61 26") + timestamp)));
    samples.push_back(
        received("Follow_Up", qvtest::hexOctets(header("18", "00 2C", "02", "07 21") + timestamp)));
    samples.push_back(received("Signaling", qvtest::hexOctets(header("1C", "00 2C", "05", "00 1F") +
                                                              "00 1B 21 FF FE 0A 0B 0C | 00 09")));
    expectAgreement(samples);
}

}  // namespace
