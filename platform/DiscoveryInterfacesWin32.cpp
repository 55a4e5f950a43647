#include <windows.h>

#include "platform/CodePage.h"
#include "platform/DiscoveryInterfaces.h"
#include "platform/Exception.h"

namespace qv::dsc::osdep {

// Windows backend: a REG_SZ value beside findClocksTimeout under HKEY_LOCAL_MACHINE.

namespace {

constexpr const wchar_t* kKeyPathW = L"Software\\Quarvel\\Corbel\\qv-1588";
constexpr const wchar_t* kValueNameW = L"interfaces";
// Far more than any list of interface names: a larger value is not a setting of ours.
constexpr DWORD kMaxOctets = 4096;

}  // namespace

std::string DiscoveryInterfaces::readStored() {
    wchar_t text[kMaxOctets / sizeof(wchar_t)] = {};
    DWORD size = sizeof(text);
    if (RegGetValueW(HKEY_LOCAL_MACHINE, kKeyPathW, kValueNameW, RRF_RT_REG_SZ, nullptr, text,
                     &size) != ERROR_SUCCESS) {
        return {};
    }
    try {
        // The process's code page, as getenv gives QV_INTERFACES and the interfaces' names.
        return CodePage::wideToAnsi(reinterpret_cast<const char16_t*>(text), "");
    } catch (const exception::Exception&) {
        return {};
    }
}

}  // namespace qv::dsc::osdep
