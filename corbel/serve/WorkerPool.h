#ifndef QV_CORBEL_SERVE_WORKERPOOL_H
#define QV_CORBEL_SERVE_WORKERPOOL_H

#include <httplib.h>

#include <condition_variable>
#include <deque>
#include <functional>
#include <mutex>
#include <thread>
#include <vector>

namespace corbel {

// The HTTP server's connection handlers: a fixed number of threads and a bounded queue of
// accepted connections. When the queue is full, the accepting thread handles the
// connection itself, so that it accepts no more until then: the kernel's backlog then
// holds (and at its end refuses) new connections, and threads and descriptors stay bounded.
class WorkerPool final : public httplib::TaskQueue {
  public:
    WorkerPool(std::size_t threads, std::size_t queued);
    ~WorkerPool() override;
    WorkerPool(const WorkerPool&) = delete;
    WorkerPool& operator=(const WorkerPool&) = delete;

    void enqueue(std::function<void()> task) override;
    // Runs what is queued, then joins the threads.
    void shutdown() override;

  private:
    void work();

    const std::size_t capacity_;
    std::mutex lock_;
    std::condition_variable ready_;
    std::deque<std::function<void()>> tasks_;  // guarded by lock_
    bool stopping_ = false;                    // guarded by lock_
    std::vector<std::thread> threads_;
};

}  // namespace corbel

#endif
