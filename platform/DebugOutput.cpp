#include "platform/DebugOutput.h"

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <mutex>

namespace nQVTARN000 {

namespace {

// The destination named by QV_TRACE, opened once on first use.
class tEnvironmentOutput {
  public:
    tEnvironmentOutput() {
        const char* choice = std::getenv("QV_TRACE");
        if (choice == nullptr || *choice == '\0') {
            return;
        }
        if (std::strcmp(choice, "stderr") == 0) {
            stream_ = stderr;
        } else {
            stream_ = std::fopen(choice, "ae");
            owned_ = stream_ != nullptr;
        }
    }
    ~tEnvironmentOutput() {
        if (owned_) {
            std::fclose(stream_);
        }
    }
    tEnvironmentOutput(const tEnvironmentOutput&) = delete;
    tEnvironmentOutput& operator=(const tEnvironmentOutput&) = delete;

    bool isOpen() const { return stream_ != nullptr; }

    void write(const char* text) {
        if (stream_ != nullptr) {
            std::fputs(text, stream_);
            std::fflush(stream_);
        }
    }

  private:
    std::FILE* stream_ = nullptr;
    bool owned_ = false;
};

std::mutex& outputLock() {
    static std::mutex lock;
    return lock;
}

tDebugOutputTarget& installedTarget() {  // guarded by outputLock()
    static tDebugOutputTarget target{nullptr, nullptr};
    return target;
}

// Whether installedTarget() has a sink, for readers that take no lock.
std::atomic<bool> sinkInstalled{false};

// Opened on first use; its stream is written under outputLock().
tEnvironmentOutput& environmentOutput() {
    static tEnvironmentOutput output;
    return output;
}

}  // namespace

void outputDebugString(const char* text) {
    std::lock_guard<std::mutex> guard(outputLock());
    const tDebugOutputTarget& target = installedTarget();
    if (target.sink != nullptr) {
        target.sink(text, target.context);
        return;
    }
    environmentOutput().write(text);
}

bool debugOutputListens() {
    return sinkInstalled.load() || environmentOutput().isOpen();
}

tDebugOutputTarget setDebugOutputSink(tDebugOutputTarget target) {
    std::lock_guard<std::mutex> guard(outputLock());
    tDebugOutputTarget previous = installedTarget();
    installedTarget() = target;
    sinkInstalled.store(target.sink != nullptr);
    return previous;
}

}  // namespace nQVTARN000
