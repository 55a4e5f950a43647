#ifndef QV_CORBEL_SERVE_ACCESSTOKEN_H
#define QV_CORBEL_SERVE_ACCESSTOKEN_H

#include <optional>
#include <string>
#include <string_view>

namespace corbel {

// The secret that a write must carry in "Authorization: Bearer TOKEN".
class AccessToken {
  public:
    enum class Source { file, environment, generated };

    // From `file` (its first line) when given, else from the environment variable
    // CORBEL_SERVE_TOKEN, else 128 random bits as 32 hexadecimal digits. Nothing, with
    // `failure` set, when the file cannot be read or holds no token.
    static std::optional<AccessToken> load(const std::string& file, std::string& failure);

    explicit AccessToken(std::string value, Source source)
        : value_(std::move(value)), source_(source) {}

    const std::string& value() const { return value_; }
    Source source() const { return source_; }
    // Whether a configured one (file or variable) was given.
    bool configured() const { return source_ != Source::generated; }

    // Compares in a time that does not depend on where `candidate` first differs.
    bool matches(std::string_view candidate) const;
    // The token of an Authorization header ("Bearer TOKEN"), else empty.
    static std::string_view bearerOf(std::string_view authorization);

  private:
    std::string value_;
    Source source_;
};

}  // namespace corbel

#endif
