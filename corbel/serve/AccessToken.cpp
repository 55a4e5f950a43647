#include "corbel/serve/AccessToken.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <random>

namespace corbel {

namespace {

constexpr const char* kVariable = "CORBEL_SERVE_TOKEN";

std::string withoutSpaceAround(std::string text) {
    const auto first = text.find_first_not_of(" \t\r\n");
    if (first == std::string::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(" \t\r\n") - first + 1);
}

std::string randomToken() {
    std::random_device entropy;  // the kernel's random source
    std::string token;
    for (int i = 0; i < 4; ++i) {
        char digits[9];
        std::snprintf(digits, sizeof digits, "%08x", static_cast<unsigned>(entropy()));
        token += digits;
    }
    return token;
}

}  // namespace

std::optional<AccessToken> AccessToken::load(const std::string& file, std::string& failure) {
    if (!file.empty()) {
        std::ifstream in(file);
        std::string line;
        if (!in || !std::getline(in, line)) {
            failure = "cannot read the token file " + file;
            return std::nullopt;
        }
        line = withoutSpaceAround(line);
        if (line.empty()) {
            failure = "the token file " + file + " holds no token on its first line";
            return std::nullopt;
        }
        return AccessToken(line, Source::file);
    }
    if (const char* variable = std::getenv(kVariable); variable != nullptr) {
        if (std::string token = withoutSpaceAround(variable); !token.empty()) {
            return AccessToken(token, Source::environment);
        }
    }
    return AccessToken(randomToken(), Source::generated);
}

bool AccessToken::matches(std::string_view candidate) const {
    // Every octet of the longer text is looked at, whatever differs where.
    const std::size_t length = std::max(value_.size(), candidate.size());
    unsigned difference = value_.size() == candidate.size() ? 0u : 1u;
    for (std::size_t i = 0; i < length; ++i) {
        const auto ours = static_cast<unsigned char>(i < value_.size() ? value_[i] : 0);
        const auto theirs = static_cast<unsigned char>(i < candidate.size() ? candidate[i] : 0);
        difference |= static_cast<unsigned>(ours ^ theirs);
    }
    return difference == 0 && !value_.empty();
}

std::string_view AccessToken::bearerOf(std::string_view authorization) {
    constexpr std::string_view kScheme = "Bearer ";
    if (authorization.size() <= kScheme.size() || authorization.substr(0, 7) != kScheme) {
        return {};
    }
    return authorization.substr(kScheme.size());
}

}  // namespace corbel
