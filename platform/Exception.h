#ifndef QV_PLATFORM_EXCEPTION_H
#define QV_PLATFORM_EXCEPTION_H

#include <cstdint>
#include <exception>

namespace qv::dsc::exception {

// Root of the exceptions thrown by the utility layer. The thrower names the place of the
// failure (a source name and a line) so that a caller that catches it can report where it
// came from; each derived type answers a code that identifies the kind of failure.
class Exception : public std::exception {
  public:
    explicit Exception(const char* file = "", std::uint32_t line = 0) noexcept
        : file_(file != nullptr ? file : ""), line_(line) {}
    ~Exception() override = default;

    const char* what() const noexcept override;
    virtual std::uint32_t errorCode() const noexcept;

    const char* file() const noexcept { return file_; }
    std::uint32_t line() const noexcept { return line_; }

  private:
    const char* file_;  // static text of the thrower
    std::uint32_t line_;
};

}  // namespace qv::dsc::exception

#endif
