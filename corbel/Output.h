#ifndef QV_CORBEL_OUTPUT_H
#define QV_CORBEL_OUTPUT_H

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace corbel {

// Results go to standard output; errors and notes to standard error, so that the JSON of
// a read command is never mixed with them.
class Output {
  public:
    explicit Output(bool json) : json_(json) {}

    bool json() const { return json_; }

    // An error: "corbel: MESSAGE" as text, or one JSON object per line with "error" (a
    // fixed word: "usage", "not-found", "rejected", "refused", "no-expert") and "message",
    // plus `details`.
    void error(const std::string& kind, const std::string& message,
               const nlohmann::json& details = nlohmann::json::object()) const;

    void printJson(const nlohmann::json& document) const;

  private:
    bool json_;
};

// Columns padded to their widest cell; the last column is not padded.
class Table {
  public:
    void add(std::vector<std::string> row) { rows_.push_back(std::move(row)); }
    void print(const std::string& indent = "") const;

  private:
    std::vector<std::vector<std::string>> rows_;
};

}  // namespace corbel

#endif
