#ifndef QV_PLATFORM_TCRITICALSECTION_H
#define QV_PLATFORM_TCRITICALSECTION_H

#include <mutex>

namespace nQVPTPMGMT000::nQVTARN000 {

// A plain lock for code that cannot fail halfway: enter and leave, always paired.
class tCriticalSection {
  public:
    tCriticalSection() = default;
    tCriticalSection(const tCriticalSection&) = delete;
    tCriticalSection& operator=(const tCriticalSection&) = delete;

    void enter() { lock_.lock(); }
    void leave() { lock_.unlock(); }

  private:
    std::mutex lock_;
};

}  // namespace nQVPTPMGMT000::nQVTARN000

#endif
