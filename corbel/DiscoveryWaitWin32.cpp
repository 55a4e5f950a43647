#include <windows.h>
// After windows.h, which it needs.
#include <io.h>

#include <cstdio>

#include "corbel/DiscoveryWait.h"
#include "platform/FindClocksTimeout.h"

namespace corbel {

// Windows backend: the expert reads its wait from the registry value findClocksTimeout
// under HKEY_LOCAL_MACHINE. A wait chosen for one run is written there (which needs the
// right to) and the earlier value is put back afterwards.

namespace {

constexpr const wchar_t* kKeyPath = L"Software\\Quarvel\\Corbel\\qv-1588";
constexpr const wchar_t* kValueName = L"findClocksTimeout";

// The value as it was before this run, put back when the run ends.
struct tSavedValue {
    bool present = false;
    DWORD number = 0;
};

tSavedValue& savedValue() {
    static tSavedValue saved;
    return saved;
}

bool writeWait(DWORD milliseconds) {
    HKEY key = nullptr;
    if (RegCreateKeyExW(HKEY_LOCAL_MACHINE, kKeyPath, 0, nullptr, 0, KEY_READ | KEY_WRITE, nullptr,
                        &key, nullptr) != ERROR_SUCCESS) {
        return false;
    }
    DWORD size = sizeof(savedValue().number);
    DWORD type = 0;
    savedValue().present =
        RegQueryValueExW(key, kValueName, nullptr, &type,
                         reinterpret_cast<BYTE*>(&savedValue().number), &size) == ERROR_SUCCESS &&
        type == REG_DWORD;
    const bool written =
        RegSetValueExW(key, kValueName, 0, REG_DWORD, reinterpret_cast<const BYTE*>(&milliseconds),
                       sizeof(milliseconds)) == ERROR_SUCCESS;
    RegCloseKey(key);
    return written;
}

void restoreWait() {
    HKEY key = nullptr;
    if (RegOpenKeyExW(HKEY_LOCAL_MACHINE, kKeyPath, 0, KEY_WRITE, &key) != ERROR_SUCCESS) {
        return;
    }
    if (savedValue().present) {
        RegSetValueExW(key, kValueName, 0, REG_DWORD,
                       reinterpret_cast<const BYTE*>(&savedValue().number),
                       sizeof(savedValue().number));
    } else {
        RegDeleteValueW(key, kValueName);
    }
    RegCloseKey(key);
}

}  // namespace

DiscoveryWait::DiscoveryWait(std::optional<std::uint32_t> milliseconds)
    : milliseconds_(milliseconds) {
    if (milliseconds_ && !writeWait(*milliseconds_)) {
        std::fprintf(stderr,
                     "corbel: cannot write the registry value for --wait; using the "
                     "stored wait\n");
        milliseconds_.reset();
    }
}

DiscoveryWait::~DiscoveryWait() {
    if (milliseconds_) {
        restoreWait();
    }
}

std::uint16_t DiscoveryWait::effectiveMilliseconds() const {
    // The expert uses the low 16 bits.
    return milliseconds_ ? static_cast<std::uint16_t>(*milliseconds_ & 0xFFFF)
                         : qv::dsc::osdep::FindClocksTimeout::read();
}

void DiscoveryWait::announce(const char* purpose) const {
    if (_isatty(_fileno(stderr)) != 0) {
        std::fprintf(stderr,
                     "corbel: %s: waiting %u ms for PTP clocks in domains 0 to 3 to answer\n",
                     purpose, effectiveMilliseconds());
    }
}

}  // namespace corbel
