#ifndef QV_CORBEL_CLI_OUTPUT_H
#define QV_CORBEL_CLI_OUTPUT_H

#include <nlohmann/json.hpp>
#include <string>

namespace corbel {

// Results go to standard output; errors and notes to standard error, so that the JSON of
// a command is never mixed with them.
class Output {
  public:
    explicit Output(bool json) : json_(json) {}

    bool json() const { return json_; }

    // An error: "corbel: MESSAGE" as text, or one JSON object per line with "error" (a
    // fixed word: "usage", "not-found", "rejected", "failed", "no-expert") and "message",
    // plus `details`.
    void error(const std::string& kind, const std::string& message,
               const nlohmann::ordered_json& details = nlohmann::ordered_json::object()) const;

    // Indented JSON and a line end, on standard output.
    void printJson(const nlohmann::ordered_json& document) const;
    // One line of JSON, flushed at once (for a stream of samples).
    void printJsonLine(const nlohmann::ordered_json& document) const;

  private:
    bool json_;
};

}  // namespace corbel

#endif
