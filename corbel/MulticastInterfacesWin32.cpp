#include <winsock2.h>
// After winsock2.h, which they need.
#include <iphlpapi.h>
#include <windows.h>

#include <vector>

#include "corbel/MulticastInterfaces.h"

namespace corbel {

namespace {

std::string utf8Of(const wchar_t* text) {
    const int size = WideCharToMultiByte(CP_UTF8, 0, text, -1, nullptr, 0, nullptr, nullptr);
    std::string result(size > 0 ? static_cast<std::size_t>(size) : 0u, '\0');
    if (size > 0) {
        WideCharToMultiByte(CP_UTF8, 0, text, -1, result.data(), size, nullptr, nullptr);
        result.pop_back();  // the terminator
    }
    return result;
}

}  // namespace

std::vector<std::string> MulticastInterfaces::names() {
    std::vector<std::string> names;
    ULONG size = 16 * 1024;
    std::vector<unsigned char> buffer;
    ULONG result = ERROR_BUFFER_OVERFLOW;
    for (int attempt = 0; attempt < 3 && result == ERROR_BUFFER_OVERFLOW; ++attempt) {
        buffer.resize(size);
        result = GetAdaptersAddresses(
            AF_INET, GAA_FLAG_SKIP_ANYCAST | GAA_FLAG_SKIP_MULTICAST | GAA_FLAG_SKIP_DNS_SERVER,
            nullptr, reinterpret_cast<IP_ADAPTER_ADDRESSES*>(buffer.data()), &size);
    }
    if (result != NO_ERROR) {
        return names;
    }
    for (auto* adapter = reinterpret_cast<IP_ADAPTER_ADDRESSES*>(buffer.data()); adapter != nullptr;
         adapter = adapter->Next) {
        if (adapter->OperStatus == IfOperStatusUp && adapter->IfType != IF_TYPE_SOFTWARE_LOOPBACK &&
            (adapter->Flags & IP_ADAPTER_NO_MULTICAST) == 0 &&
            adapter->FirstUnicastAddress != nullptr) {
            names.push_back(utf8Of(adapter->FriendlyName));
        }
    }
    return names;
}

}  // namespace corbel
