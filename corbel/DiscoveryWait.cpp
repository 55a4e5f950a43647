#include "corbel/DiscoveryWait.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>

namespace corbel {

namespace {

constexpr const char* kRootVariable = "QV_SETTINGS_ROOT";
constexpr const char* kDefaultRoot = "/etc/corbel";
constexpr const char* kValuePath = "Software/Quarvel/Corbel/qv-1588/findClocksTimeout";
constexpr std::uint32_t kDefaultMilliseconds = 1000;

// The stored number as the expert reads it: decimal, or hexadecimal after "0x".
std::optional<std::uint32_t> storedMilliseconds() {
    const char* root = std::getenv(kRootVariable);
    std::ifstream file(std::filesystem::path(root != nullptr ? root : kDefaultRoot) / kValuePath);
    std::string text;
    if (!(file >> text)) {
        return std::nullopt;
    }
    const bool hex = text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X');
    char* end = nullptr;
    const unsigned long long value = std::strtoull(text.c_str(), &end, hex ? 16 : 10);
    if (end == text.c_str() || *end != '\0' || value > 0xFFFFFFFFull || text[0] == '-') {
        return std::nullopt;
    }
    return static_cast<std::uint32_t>(value);
}

}  // namespace

DiscoveryWait::DiscoveryWait(std::optional<std::uint32_t> milliseconds)
    : milliseconds_(milliseconds) {
    if (!milliseconds_) {
        return;
    }
    std::string pattern = (std::filesystem::temp_directory_path() / "corbel-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        std::fprintf(stderr,
                     "corbel: cannot make a settings folder for --wait; using the stored wait\n");
        milliseconds_.reset();
        return;
    }
    ownRoot_ = pattern;
    const auto value = ownRoot_ / kValuePath;
    std::error_code error;
    std::filesystem::create_directories(value.parent_path(), error);
    std::ofstream(value) << *milliseconds_ << '\n';
    setenv(kRootVariable, ownRoot_.c_str(), 1);
}

DiscoveryWait::~DiscoveryWait() {
    if (!ownRoot_.empty()) {
        std::error_code error;
        std::filesystem::remove_all(ownRoot_, error);
    }
}

std::uint16_t DiscoveryWait::effectiveMilliseconds() const {
    // The expert uses the low 16 bits.
    return static_cast<std::uint16_t>(
        milliseconds_.value_or(storedMilliseconds().value_or(kDefaultMilliseconds)) & 0xFFFF);
}

void DiscoveryWait::announce(const char* purpose) const {
    if (isatty(STDERR_FILENO) != 0) {
        std::fprintf(stderr,
                     "corbel: %s: waiting %u ms for PTP clocks in domains 0 to 3 to answer\n",
                     purpose, effectiveMilliseconds());
    }
}

}  // namespace corbel
