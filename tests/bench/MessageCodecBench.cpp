// How long the codec takes for what the management client does all the time: decoding the
// datagrams that arrive (management responses, and the Announce messages that every master
// multicasts) and encoding a request.

#include <benchmark/benchmark.h>

#include <cctype>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tManagementIdTable.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tPTPMessageFactory.h"
#include "ptp/tProtocolDataUnit.h"

using namespace nQVPTP000;

namespace {

// A datagram of the corpus of real peers, from its hex file.
std::vector<std::uint8_t> corpusDatagram(const char* name) {
    std::ifstream in(std::string(QV_TEST_DATA_DIR) + "/corpus/" + name + ".hex");
    std::stringstream buffer;
    buffer << in.rdbuf();
    const std::string text = buffer.str();
    std::vector<std::uint8_t> octets;
    std::string digits;
    for (char c : text) {
        if (std::isxdigit(static_cast<unsigned char>(c)) != 0) {
            digits += c;
        }
        if (digits.size() == 2) {
            octets.push_back(static_cast<std::uint8_t>(std::stoul(digits, nullptr, 16)));
            digits.clear();
        }
    }
    if (octets.empty()) {
        throw std::runtime_error(std::string("no corpus datagram ") + name);
    }
    return octets;
}

// The receive thread's work per datagram: fill the unit, let the factory decode it.
void decode(benchmark::State& state, const char* name) {
    const std::vector<std::uint8_t> octets = corpusDatagram(name);
    tStatus status;
    tProtocolDataUnit unit(status);
    for (auto _ : state) {
        unit.reset();
        unit.writeOctets(octets.data(), octets.size(), status);
        auto message = tPTPMessageFactory::createMessage(unit, status);
        benchmark::DoNotOptimize(message.get());
    }
    if (status.failed()) {
        state.SkipWithError("decoding failed");
    }
}

// A GET request as the client builds it, with the default TLV of `managementId`.
std::unique_ptr<tManagementMessage> request(std::uint16_t managementId, tStatus& status) {
    auto message = std::make_unique<tManagementMessage>(status);
    message->setActionField(tManagementMessagePayload::kGet, status);
    const tManagementIdEntry* row = findManagementId(managementId);
    message->setPayload(row != nullptr ? row->create() : std::make_unique<tNullManagementTLV>(),
                        status);
    message->getHeader()->setDomainNumber(0, status);
    return message;
}

void BM_DecodeManagementResponseNullManagement(benchmark::State& state) {
    decode(state, "ptp4l-mgmt-null_management");
}

void BM_DecodeManagementResponseDefaultDataSet(benchmark::State& state) {
    decode(state, "ptp4l-mgmt-default_data_set");
    state.SetLabel(findManagementId(kDefaultDataSet) != nullptr ? "TLV decoded"
                                                                : "TLV id not built, skipped");
}

void BM_DecodeAnnounce(benchmark::State& state) {
    decode(state, "ptp4l-announce");
}

void BM_EncodeManagementRequest(benchmark::State& state) {
    tStatus status;
    const auto message = request(kDefaultDataSet, status);
    tProtocolDataUnit unit(status);
    std::uint16_t sequenceId = 0;
    for (auto _ : state) {
        unit.reset();
        message->getHeader()->setSequenceId(++sequenceId, status);
        message->serialize(unit, status);
        benchmark::DoNotOptimize(unit.getBuffer());
    }
    if (status.failed()) {
        state.SkipWithError("encoding failed");
    }
}

void BM_BuildAndEncodeManagementRequest(benchmark::State& state) {
    tStatus status;
    tProtocolDataUnit unit(status);
    for (auto _ : state) {
        unit.reset();
        request(kDefaultDataSet, status)->serialize(unit, status);
        benchmark::DoNotOptimize(unit.getBuffer());
    }
    if (status.failed()) {
        state.SkipWithError("encoding failed");
    }
}

}  // namespace

BENCHMARK(BM_DecodeManagementResponseNullManagement);
BENCHMARK(BM_DecodeManagementResponseDefaultDataSet);
BENCHMARK(BM_DecodeAnnounce);
BENCHMARK(BM_EncodeManagementRequest);
BENCHMARK(BM_BuildAndEncodeManagementRequest);
