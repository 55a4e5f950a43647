#include <windows.h>

#include <mutex>

#include "platform/DebugOutput.h"

namespace nQVTARN000 {

// Windows backend: trace lines go to the debugger output, unless a program (a test) has
// installed its own sink.

namespace {

std::mutex& outputLock() {
    static std::mutex lock;
    return lock;
}

tDebugOutputTarget& installedTarget() {  // guarded by outputLock()
    static tDebugOutputTarget target{nullptr, nullptr};
    return target;
}

}  // namespace

void outputDebugString(const char* text) {
    std::lock_guard<std::mutex> guard(outputLock());
    const tDebugOutputTarget& target = installedTarget();
    if (target.sink != nullptr) {
        target.sink(text, target.context);
        return;
    }
    OutputDebugStringA(text);
}

bool debugOutputListens() {
    return true;
}

tDebugOutputTarget setDebugOutputSink(tDebugOutputTarget target) {
    std::lock_guard<std::mutex> guard(outputLock());
    tDebugOutputTarget previous = installedTarget();
    installedTarget() = target;
    return previous;
}

}  // namespace nQVTARN000
