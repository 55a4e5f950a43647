#include "corbel/serve/HostRules.h"

#include <algorithm>

namespace corbel {

namespace {

std::string lowerCase(std::string_view text) {
    std::string lower(text);
    std::ranges::transform(lower, lower.begin(), [](char c) {
        return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c;
    });
    return lower;
}

}  // namespace

HostRules::HostRules(const ListenAddress& listen, const std::vector<std::string>& allowHosts)
    : port_(std::to_string(listen.port)) {
    names_.push_back(lowerCase(listen.hostText()));
    if (listen.isLoopback()) {
        names_.insert(names_.end(), {"localhost", "127.0.0.1", "[::1]"});
    }
    for (const std::string& name : allowHosts) {
        names_.push_back(lowerCase(name));
    }
}

bool HostRules::allowsHost(std::string_view host) const {
    const std::string lower = lowerCase(host);
    const auto known = [this](std::string_view name) {
        return std::ranges::find(names_, name) != names_.end();
    };
    if (lower.empty() || known(lower)) {
        return !lower.empty();
    }
    // "name:port" or "[v6]:port": the name alone must be known and the port ours.
    const auto colon = lower.rfind(':');
    const auto bracket = lower.rfind(']');
    if (colon == std::string::npos || (bracket != std::string::npos && colon < bracket)) {
        return false;
    }
    return lower.substr(colon + 1) == port_ && known(std::string_view(lower).substr(0, colon));
}

bool HostRules::allowsOrigin(std::string_view origin) const {
    constexpr std::string_view kScheme = "http://";
    return origin.starts_with(kScheme) && allowsHost(origin.substr(kScheme.size()));
}

}  // namespace corbel
