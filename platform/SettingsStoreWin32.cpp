#include <windows.h>

#include "platform/CodePage.h"
#include "platform/Exception.h"
#include "platform/OleText.h"
#include "platform/SettingsStore.h"

namespace qv::dsc::osdep {

// Windows backend: a key under HKEY_LOCAL_MACHINE in the registry.

namespace {

constexpr wchar_t kKeyClass[] = L"qv-1588";
// Far more than any text setting of ours: a larger value is not one.
constexpr DWORD kMaxTextOctets = 8192;

bool isValueName(std::string_view name) {
    return !name.empty() && name != "." && name != ".." &&
           name.find_first_of(std::string_view("/\0", 2)) == name.npos;
}

// The key path as the registry spells it: segments joined by '\', "." and ".." dropped.
std::string registryPath(std::string_view keyPath) {
    std::string path;
    while (!keyPath.empty()) {
        const std::size_t end = keyPath.find_first_of("\\/");
        const std::string_view segment = keyPath.substr(0, end);
        if (!segment.empty() && segment != "." && segment != "..") {
            path += path.empty() ? "" : "\\";
            path += segment;
        }
        keyPath.remove_prefix(end == keyPath.npos ? keyPath.size() : end + 1);
    }
    return path;
}

// ASCII names only: the key paths and value names are the program's own constants.
std::wstring wide(std::string_view ascii) {
    std::wstring text;
    for (const char c : ascii) {
        text.push_back(static_cast<wchar_t>(static_cast<unsigned char>(c)));
    }
    return text;
}

// The key, opened read-only (created when the caller may), closed on every path.
class tRegistryKey {
  public:
    explicit tRegistryKey(const std::wstring& path) {
        // A second try rides over a transient failure (the registry busy at start-up).
        for (int attempt = 0; attempt < 2 && key_ == nullptr; ++attempt) {
            DWORD disposition = 0;
            HKEY key = nullptr;
            if (RegCreateKeyExW(HKEY_LOCAL_MACHINE, path.c_str(), 0,
                                const_cast<wchar_t*>(kKeyClass), 0, KEY_READ, nullptr, &key,
                                &disposition) == ERROR_SUCCESS) {
                key_ = key;
            }
        }
    }
    ~tRegistryKey() {
        if (key_ != nullptr) {
            RegCloseKey(key_);
        }
    }
    tRegistryKey(const tRegistryKey&) = delete;
    tRegistryKey& operator=(const tRegistryKey&) = delete;

    // Only a 32-bit number counts: a text or a shorter value would give a made-up number.
    std::optional<std::uint32_t> readNumber(const std::wstring& name) const {
        if (key_ == nullptr) {
            return std::nullopt;
        }
        DWORD type = 0;
        DWORD value = 0;
        DWORD size = sizeof(value);
        if (RegQueryValueExW(key_, name.c_str(), nullptr, &type, reinterpret_cast<BYTE*>(&value),
                             &size) != ERROR_SUCCESS ||
            type != REG_DWORD || size != sizeof(value)) {
            return std::nullopt;
        }
        return value;
    }

  private:
    HKEY key_ = nullptr;
};

}  // namespace

SettingsStore::SettingsStore(std::string_view keyPath) : location_(registryPath(keyPath)) {}

std::optional<std::uint32_t> SettingsStore::readNumber(std::string_view valueName) const {
    if (!isValueName(valueName)) {
        return std::nullopt;
    }
    return tRegistryKey(wide(location_)).readNumber(wide(valueName));
}

std::optional<std::string> SettingsStore::readText(std::string_view valueName) const {
    wchar_t text[kMaxTextOctets / sizeof(wchar_t)] = {};
    DWORD size = sizeof(text);
    if (!isValueName(valueName) ||
        RegGetValueW(HKEY_LOCAL_MACHINE, wide(location_).c_str(), wide(valueName).c_str(),
                     RRF_RT_REG_SZ, nullptr, text, &size) != ERROR_SUCCESS) {
        return std::nullopt;
    }
    try {
        // The process's code page, as the environment gives its variables.
        return CodePage::wideToAnsi(OleText::toLibrary(text), "");
    } catch (const exception::Exception&) {
        return std::nullopt;
    }
}

}  // namespace qv::dsc::osdep
