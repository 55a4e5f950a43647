#ifndef QV_CORBEL_SERVE_SERVICECOUNTERS_H
#define QV_CORBEL_SERVE_SERVICECOUNTERS_H

#include <qv1588/qv1588.h>

#include <array>
#include <atomic>
#include <cstdint>
#include <utility>
#include <vector>

namespace corbel {

// What the service counts for its metrics; safe from any thread.
class ServiceCounters {
  public:
    // The reasons of corbel_exchanges_failed_total, as its label values say them.
    static constexpr std::array<const char*, 4> kReasons = {"refused", "no_answer", "network",
                                                            "other"};

    void countFailure(kxQvFailureKind kind);
    void countResponse(int status);

    // By kReasons.
    std::array<std::uint64_t, 4> failures() const;
    // (status, count) for every status answered at least once, in ascending order.
    std::vector<std::pair<int, std::uint64_t>> responses() const;

  private:
    std::array<std::atomic<std::uint64_t>, 4> failures_{};
    std::array<std::atomic<std::uint64_t>, 600> responses_{};  // by status code
};

}  // namespace corbel

#endif
