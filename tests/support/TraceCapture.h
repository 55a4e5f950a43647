#ifndef QV_TESTS_SUPPORT_TRACECAPTURE_H
#define QV_TESTS_SUPPORT_TRACECAPTURE_H

#include <string>
#include <vector>

#include "platform/DebugOutput.h"
#include "platform/iTraceDestination.h"

namespace qvtest {

// The pieces one after another.
std::string joined(const std::vector<std::string>& pieces);

// Collects what reaches the debug output while alive.
class DebugOutputCapture {
  public:
    DebugOutputCapture();
    ~DebugOutputCapture() { nQVTARN000::setDebugOutputSink(previous_); }
    DebugOutputCapture(const DebugOutputCapture&) = delete;
    DebugOutputCapture& operator=(const DebugOutputCapture&) = delete;

    const std::vector<std::string>& pieces() const { return pieces_; }
    std::string text() const { return joined(pieces_); }

  private:
    static void collect(const char* text, void* context);
    std::vector<std::string> pieces_;
    nQVTARN000::tDebugOutputTarget previous_;
};

// A trace destination that keeps every piece, for tests of trace texts.
class RecordingDestination final : public nQVTARN000::iTraceDestination {
  public:
    void write(const char* text, std::size_t length) override {
        pieces_.emplace_back(text, length);
    }
    void write(const char* text) override { pieces_.emplace_back(text); }
    const std::vector<std::string>& pieces() const { return pieces_; }
    std::string text() const { return joined(pieces_); }
    void clear() { pieces_.clear(); }

  private:
    std::vector<std::string> pieces_;
};

}  // namespace qvtest

#endif
