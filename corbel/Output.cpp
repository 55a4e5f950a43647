#include "corbel/Output.h"

#include <cstdio>

namespace corbel {

void Output::error(const std::string& kind, const std::string& message,
                   const nlohmann::json& details) const {
    if (!json_) {
        std::fprintf(stderr, "corbel: %s\n", message.c_str());
        return;
    }
    nlohmann::json line = details;
    line["error"] = kind;
    line["message"] = message;
    std::fprintf(stderr, "%s\n",
                 line.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace).c_str());
}

void Output::printJson(const nlohmann::json& document) const {
    std::printf("%s\n",
                document.dump(2, ' ', false, nlohmann::json::error_handler_t::replace).c_str());
}

void Table::print(const std::string& indent) const {
    std::vector<std::size_t> widths;
    for (const auto& row : rows_) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t column = 0; column < row.size(); ++column) {
            widths[column] = std::max(widths[column], row[column].size());
        }
    }
    for (const auto& row : rows_) {
        std::string line = indent;
        for (std::size_t column = 0; column < row.size(); ++column) {
            line += row[column];
            if (column + 1 < row.size()) {
                line += std::string(widths[column] - row[column].size() + 2, ' ');
            }
        }
        std::printf("%s\n", line.c_str());
    }
}

}  // namespace corbel
