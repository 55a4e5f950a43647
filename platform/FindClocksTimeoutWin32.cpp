#include <windows.h>

#include <optional>

#include "platform/FindClocksTimeout.h"

namespace qv::dsc::osdep {

// Windows backend: the value under HKEY_LOCAL_MACHINE in the registry.

namespace {

constexpr const wchar_t* kKeyPathW = L"Software\\Quarvel\\Corbel\\qv-1588";
constexpr const wchar_t* kValueNameW = L"findClocksTimeout";
constexpr wchar_t kKeyClass[] = L"qv-1588";

// The key, opened read-only (created when the caller may), closed on every path.
class tSettingsKey {
  public:
    tSettingsKey() {
        // A second try rides over a transient failure (the registry busy at start-up).
        for (int attempt = 0; attempt < 2 && key_ == nullptr; ++attempt) {
            DWORD disposition = 0;
            HKEY key = nullptr;
            if (RegCreateKeyExW(HKEY_LOCAL_MACHINE, kKeyPathW, 0, const_cast<wchar_t*>(kKeyClass),
                                0, KEY_READ, nullptr, &key, &disposition) == ERROR_SUCCESS) {
                key_ = key;
            }
        }
    }
    ~tSettingsKey() {
        if (key_ != nullptr) {
            RegCloseKey(key_);
        }
    }
    tSettingsKey(const tSettingsKey&) = delete;
    tSettingsKey& operator=(const tSettingsKey&) = delete;

    // Only a 32-bit number counts: a text or a shorter value would give a made-up wait.
    std::optional<std::uint32_t> readNumber(const wchar_t* name) const {
        if (key_ == nullptr) {
            return std::nullopt;
        }
        DWORD type = 0;
        DWORD value = 0;
        DWORD size = sizeof(value);
        if (RegQueryValueExW(key_, name, nullptr, &type, reinterpret_cast<BYTE*>(&value), &size) !=
                ERROR_SUCCESS ||
            type != REG_DWORD || size != sizeof(value)) {
            return std::nullopt;
        }
        return value;
    }

  private:
    HKEY key_ = nullptr;
};

}  // namespace

std::uint16_t FindClocksTimeout::read() {
    const tSettingsKey key;
    return static_cast<std::uint16_t>(key.readNumber(kValueNameW).value_or(kDefault) & 0xFFFF);
}

}  // namespace qv::dsc::osdep
