#ifndef QV_EXPERT_CQVCOMPTR_H
#define QV_EXPERT_CQVCOMPTR_H

#include <utility>

// Holds one reference to a host object (any class with AddRef and Release) and gives it
// back when it goes.
template <class I>
class CQVComPtr {
  public:
    CQVComPtr() = default;
    // Adds a reference of its own.
    explicit CQVComPtr(I* object) noexcept : object_(object) {
        if (object_ != nullptr) {
            object_->AddRef();
        }
    }
    CQVComPtr(const CQVComPtr& other) noexcept : CQVComPtr(other.object_) {}
    CQVComPtr(CQVComPtr&& other) noexcept : object_(std::exchange(other.object_, nullptr)) {}
    CQVComPtr& operator=(CQVComPtr other) noexcept {
        std::swap(object_, other.object_);
        return *this;
    }
    ~CQVComPtr() { reset(); }

    // Takes over a reference that the caller already holds (an out parameter's).
    static CQVComPtr Adopt(I* object) noexcept {
        CQVComPtr holder;
        holder.object_ = object;
        return holder;
    }

    I* get() const noexcept { return object_; }
    I* operator->() const noexcept { return object_; }
    I& operator*() const noexcept { return *object_; }
    explicit operator bool() const noexcept { return object_ != nullptr; }

    // Gives up the reference to the caller.
    I* Detach() noexcept { return std::exchange(object_, nullptr); }
    void reset() noexcept {
        if (I* held = std::exchange(object_, nullptr)) {
            held->Release();
        }
    }
    // For an out parameter: drops the held reference and lends the slot that receives one.
    I** Receive() noexcept {
        reset();
        return &object_;
    }

  private:
    I* object_ = nullptr;
};

#endif
