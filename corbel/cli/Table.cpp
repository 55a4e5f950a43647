#include "corbel/cli/Table.h"

#include <algorithm>
#include <cstdio>

namespace corbel {

namespace {

// UTF-8: every octet but the continuation octets starts a character.
std::size_t widthOf(const std::string& text) {
    return static_cast<std::size_t>(
        std::ranges::count_if(text, [](char octet) { return (octet & 0xC0) != 0x80; }));
}

}  // namespace

std::string Table::render(const std::string& indent) const {
    std::vector<std::size_t> widths;
    for (const auto& row : rows_) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t column = 0; column < row.size(); ++column) {
            widths[column] = std::max(widths[column], widthOf(row[column]));
        }
    }
    std::string text;
    for (const auto& row : rows_) {
        std::string line = indent;
        for (std::size_t column = 0; column < row.size(); ++column) {
            line += row[column];
            if (column + 1 < row.size()) {
                line += std::string(widths[column] - widthOf(row[column]) + 2, ' ');
            }
        }
        line.erase(line.find_last_not_of(' ') + 1);  // an empty last cell
        text += line + "\n";
    }
    return text;
}

void Table::print(const std::string& indent) const {
    std::fputs(render(indent).c_str(), stdout);
}

}  // namespace corbel
