#include "tests/support/TraceCapture.h"

namespace qvtest {

DebugOutputCapture::DebugOutputCapture()
    : previous_(nQVTARN000::setDebugOutputSink({&DebugOutputCapture::collect, this})) {}

void DebugOutputCapture::collect(const char* text, void* context) {
    static_cast<DebugOutputCapture*>(context)->pieces_.emplace_back(text);
}

std::string joined(const std::vector<std::string>& pieces) {
    std::string all;
    for (const auto& piece : pieces) {
        all += piece;
    }
    return all;
}

}  // namespace qvtest
