#include <winsock2.h>
// After winsock2.h, which it needs.
#include <iphlpapi.h>

#include <cstring>
#include <vector>

#include "platform/EthernetAdapters.h"

namespace qv::dsc::osdep {

// Windows backend: the IP helper's adapter list, in the order the system gives it.

namespace {

// The size of sixteen-odd adapter records: enough for most computers at the first try.
constexpr ULONG kFirstTryOctets = 704;

// The adapter list, grown once when the first buffer is too small (adapters may come
// between the two calls, so the second answer is the last word).
std::vector<std::uint8_t> adapterList() {
    std::vector<std::uint8_t> buffer(kFirstTryOctets);
    for (int attempt = 0; attempt < 2; ++attempt) {
        ULONG size = static_cast<ULONG>(buffer.size());
        const DWORD result =
            GetAdaptersInfo(reinterpret_cast<IP_ADAPTER_INFO*>(buffer.data()), &size);
        if (result == ERROR_SUCCESS) {
            return buffer;
        }
        if (result != ERROR_BUFFER_OVERFLOW) {
            break;
        }
        buffer.assign(size, 0);
    }
    return {};
}

}  // namespace

std::optional<EthernetAdapters::tMacAddress> EthernetAdapters::firstAddress() {
    std::vector<std::uint8_t> list = adapterList();
    if (list.empty()) {
        return std::nullopt;
    }
    for (const auto* entry = reinterpret_cast<const IP_ADAPTER_INFO*>(list.data());
         entry != nullptr; entry = entry->Next) {
        if (entry->Type == MIB_IF_TYPE_ETHERNET && entry->AddressLength == 6) {
            tMacAddress address{};
            std::memcpy(address.data(), entry->Address, address.size());
            return address;
        }
    }
    return std::nullopt;
}

}  // namespace qv::dsc::osdep
