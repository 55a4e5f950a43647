#include "tests/support/TraceCapture.h"

namespace qvtest {

DebugOutputCapture::DebugOutputCapture()
    : previous_(nQVTARN000::setDebugOutputSink({&DebugOutputCapture::collect, this})) {}

DebugOutputCapture::~DebugOutputCapture() {
    nQVTARN000::setDebugOutputSink(previous_);
}

void DebugOutputCapture::collect(const char* text, void* context) {
    static_cast<DebugOutputCapture*>(context)->pieces_.emplace_back(text);
}

std::string DebugOutputCapture::text() const {
    std::string all;
    for (const auto& piece : pieces_) {
        all += piece;
    }
    return all;
}

std::string RecordingDestination::text() const {
    std::string all;
    for (const auto& piece : pieces_) {
        all += piece;
    }
    return all;
}

}  // namespace qvtest
