#include "corbel/serve/ListenAddress.h"

#include <charconv>

namespace corbel {

std::optional<ListenAddress> ListenAddress::parse(std::string_view text) {
    const auto colon = text.rfind(':');
    if (colon == std::string_view::npos || colon == 0) {
        return std::nullopt;
    }
    std::string_view host = text.substr(0, colon);
    const std::string_view port = text.substr(colon + 1);
    if (host.front() == '[') {
        if (host.size() < 3 || host.back() != ']') {
            return std::nullopt;
        }
        host = host.substr(1, host.size() - 2);
    } else if (host.find(':') != std::string_view::npos) {
        return std::nullopt;  // an IPv6 address goes in brackets
    }
    ListenAddress address{std::string(host), 0};
    const auto parsed = std::from_chars(port.data(), port.data() + port.size(), address.port);
    if (parsed.ec != std::errc() || parsed.ptr != port.data() + port.size() || address.port < 1 ||
        address.port > 65535) {
        return std::nullopt;
    }
    return address;
}

bool ListenAddress::isLoopback() const {
    return host.starts_with("127.") || host == "::1" || host == "localhost";
}

std::string ListenAddress::hostText() const {
    return host.find(':') != std::string::npos ? "[" + host + "]" : host;
}

}  // namespace corbel
