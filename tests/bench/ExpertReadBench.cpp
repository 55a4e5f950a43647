// The expert as a host drives it: libqv1588.so loaded with dlopen in a fresh process, one
// discovery, then GetItemProperties with every readable tag (eight exchanges) against a
// real ptp4l on the private test network. Prints the median and p99 of that read and the
// process's peak resident memory after loading and discovering. Needs root; run by
// tools/bench-client.

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <fstream>
#include <string>
#include <vector>

#include "qv1588/qv1588.h"
#include "tests/expert/network/LoadedExpert.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/TestNetwork.h"

namespace {

constexpr int kReads = 300;

// VmHWM of /proc/self/status, in kB.
long peakResidentKilobytes() {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmHWM:", 0) == 0) {
            return std::stol(line.substr(6));
        }
    }
    return -1;
}

int run() {
    qvtest::TestNetwork network({"ptp4l:domain=0"});
    if (!network.isUp()) {
        std::fprintf(stderr, "test network: %s\n", network.failure().c_str());
        return 1;
    }
    qvtest::NetworkNamespaceEntry entry(network.clientNamespace());
    qvtest::LoadedExpert library;
    IkxSysExpert2* expert = nullptr;
    if (!entry.entered() || library.create() == nullptr || library.create()(&expert) != S_OK ||
        expert->Initialize() != S_OK) {
        std::fprintf(stderr, "expert: %s\n", library.failure().c_str());
        return 1;
    }
    IkxSysEnumStringList* names = nullptr;
    const HRESULT found = expert->GetItemNames(&names);
    std::printf("after loading and one discovery (0x%08X): peak resident memory %ld kB\n",
                static_cast<unsigned>(found), peakResidentKilobytes());
    if (names != nullptr) {
        names->Release();
    }
    const std::vector<kxSysAttributeTagID> tags = qvtest::readableTags();
    const std::u16string item = qvtest::itemNameOf(network.clocks()[0]);
    std::vector<double> micros;
    HRESULT result = S_OK;
    for (int i = 0; i < kReads; ++i) {
        IkxSysPropertyBag* bag = nullptr;
        const auto started = std::chrono::steady_clock::now();
        result = expert->GetItemProperties(item.c_str(), static_cast<ULONG>(tags.size()),
                                           tags.data(), nullptr, &bag);
        micros.push_back(
            std::chrono::duration<double, std::micro>(std::chrono::steady_clock::now() - started)
                .count());
        if (bag != nullptr) {
            bag->Release();
        }
    }
    std::sort(micros.begin(), micros.end());
    std::printf(
        "GetItemProperties of %zu tags on ptp4l (result 0x%08X, %d reads): median %.0f us,"
        " p99 %.0f us\n",
        tags.size(), static_cast<unsigned>(result), kReads, micros[micros.size() / 2],
        micros[micros.size() * 99 / 100]);
    expert->Shutdown();
    expert->Release();
    return 0;
}

}  // namespace

int main() {
    return run();
}
