#include "corbel/serve/WorkerPool.h"

namespace corbel {

WorkerPool::WorkerPool(std::size_t threads, std::size_t queued) : capacity_(queued) {
    for (std::size_t i = 0; i < threads; ++i) {
        threads_.emplace_back([this] { work(); });
    }
}

WorkerPool::~WorkerPool() {
    shutdown();
}

void WorkerPool::enqueue(std::function<void()> task) {
    {
        const std::lock_guard guard(lock_);
        if (tasks_.size() < capacity_ && !stopping_) {
            tasks_.push_back(std::move(task));
            ready_.notify_one();
            return;
        }
    }
    task();
}

void WorkerPool::shutdown() {
    {
        const std::lock_guard guard(lock_);
        stopping_ = true;
    }
    ready_.notify_all();
    for (std::thread& thread : threads_) {
        if (thread.joinable()) {
            thread.join();
        }
    }
}

void WorkerPool::work() {
    for (;;) {
        std::function<void()> task;
        {
            std::unique_lock guard(lock_);
            ready_.wait(guard, [this] { return stopping_ || !tasks_.empty(); });
            if (tasks_.empty()) {
                return;  // stopping, and nothing left
            }
            task = std::move(tasks_.front());
            tasks_.pop_front();
        }
        task();
    }
}

}  // namespace corbel
