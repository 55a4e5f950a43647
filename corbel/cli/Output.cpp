#include "corbel/cli/Output.h"

#include <cstdio>

namespace corbel {

namespace {

std::string dumped(const nlohmann::ordered_json& document, int indent) {
    return document.dump(indent, ' ', false, nlohmann::ordered_json::error_handler_t::replace);
}

}  // namespace

void Output::error(const std::string& kind, const std::string& message,
                   const nlohmann::ordered_json& details) const {
    if (!json_) {
        std::fprintf(stderr, "corbel: %s\n", message.c_str());
        return;
    }
    nlohmann::ordered_json line = {{"error", kind}, {"message", message}};
    line.update(details);
    std::fprintf(stderr, "%s\n", dumped(line, -1).c_str());
}

void Output::printJson(const nlohmann::ordered_json& document) const {
    std::printf("%s\n", dumped(document, 2).c_str());
}

void Output::printJsonLine(const nlohmann::ordered_json& document) const {
    std::printf("%s\n", dumped(document, -1).c_str());
    std::fflush(stdout);
}

}  // namespace corbel
