#ifndef QV_CORBEL_CLI_TABLE_H
#define QV_CORBEL_CLI_TABLE_H

#include <string>
#include <vector>

namespace corbel {

// Columns padded to their widest cell (counted in characters, not octets: units such as
// "µs" take two octets); the last column is not padded.
class Table {
  public:
    void add(std::vector<std::string> row) { rows_.push_back(std::move(row)); }
    bool empty() const { return rows_.empty(); }

    std::string render(const std::string& indent = "") const;
    void print(const std::string& indent = "") const;

  private:
    std::vector<std::vector<std::string>> rows_;
};

}  // namespace corbel

#endif
