// Decoding speed of the two TLVs that every discovery and property read decodes: a
// CLOCK_DESCRIPTION (texts, an address array and a pad octet) and a PARENT_DATA_SET (fixed
// fields). Each iteration decodes one TLV from a unit that already holds the octets.

#include <benchmark/benchmark.h>

#include <cstdint>
#include <vector>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/tProtocolDataUnit.h"

using namespace nQVPTP000;

namespace {

// A clock description as a real clock sends it: ordinary clock, "IEEE 802.3", a 6-octet
// MAC, UDP/IPv4 169.254.1.1, texts ";;" ";;" "alpha", a profile identity, one pad octet.
const std::vector<std::uint8_t> kClockDescription = {
    0x00, 0x01, 0x00, 0x36, 0x00, 0x01, 0x80, 0x00, 0x0A, 0x49, 0x45, 0x45, 0x45, 0x20, 0x38,
    0x30, 0x32, 0x2E, 0x33, 0x00, 0x06, 0x02, 0x00, 0x00, 0x00, 0x00, 0x01, 0x00, 0x01, 0x00,
    0x04, 0xA9, 0xFE, 0x01, 0x01, 0x00, 0x00, 0x00, 0x00, 0x02, 0x3B, 0x3B, 0x02, 0x3B, 0x3B,
    0x05, 0x61, 0x6C, 0x70, 0x68, 0x61, 0x00, 0x1B, 0x19, 0x00, 0x01, 0x00, 0x00};

// A parent data set: parent 020000fffe000001 port 0, statistics unknown, grandmaster
// priority 100/128, class 128.
const std::vector<std::uint8_t> kParentDataSet = {
    0x00, 0x01, 0x00, 0x22, 0x20, 0x02, 0x02, 0x00, 0x00, 0xFF, 0xFE, 0x00, 0x00,
    0x01, 0x00, 0x00, 0x00, 0x00, 0xFF, 0xFF, 0x7F, 0xFF, 0xFF, 0xFF, 0x64, 0x80,
    0xFE, 0xFF, 0xFF, 0x80, 0x02, 0x00, 0x00, 0xFF, 0xFE, 0x00, 0x00, 0x01};

template <typename T>
void decodeEach(benchmark::State& state, const std::vector<std::uint8_t>& octets) {
    tStatus status;
    tProtocolDataUnit unit(status);
    for (auto _ : state) {
        unit.reset();
        unit.writeOctets(octets.data(), octets.size(), status);
        T tlv;
        tlv.deserialize(unit, status);
        benchmark::DoNotOptimize(tlv.getLengthField());
    }
    if (status.failed()) {
        state.SkipWithError("decoding failed");
    }
    state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations()) *
                            static_cast<std::int64_t>(octets.size()));
}

void BM_DecodeClockDescription(benchmark::State& state) {
    decodeEach<tClockDescriptionTLV>(state, kClockDescription);
}
BENCHMARK(BM_DecodeClockDescription);

void BM_DecodeParentDataSet(benchmark::State& state) {
    decodeEach<tParentDataSetTLV>(state, kParentDataSet);
}
BENCHMARK(BM_DecodeParentDataSet);

}  // namespace

BENCHMARK_MAIN();
