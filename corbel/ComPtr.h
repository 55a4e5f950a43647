#ifndef QV_CORBEL_COMPTR_H
#define QV_CORBEL_COMPTR_H

#include <qv1588/corbel.h>

#include <utility>

namespace corbel {

// Holds one reference to a host-boundary object and gives it back with Release: an out
// parameter hands over one reference (see the header), which `out` receives.
template <typename Interface>
class ComPtr {
  public:
    ComPtr() = default;
    ~ComPtr() { reset(); }
    ComPtr(const ComPtr&) = delete;
    ComPtr& operator=(const ComPtr&) = delete;
    ComPtr(ComPtr&& other) noexcept : object_(std::exchange(other.object_, nullptr)) {}
    ComPtr& operator=(ComPtr&& other) noexcept {
        if (this != &other) {
            reset();
            object_ = std::exchange(other.object_, nullptr);
        }
        return *this;
    }

    Interface* get() const { return object_; }
    Interface* operator->() const { return object_; }
    Interface& operator*() const { return *object_; }
    explicit operator bool() const { return object_ != nullptr; }

    // For an out parameter: gives back what is held first.
    Interface** out() {
        reset();
        return &object_;
    }

    // The same object under another interface; empty when it does not offer it.
    template <typename Other>
    ComPtr<Other> query(const IID& iid) const;

    void reset() {
        if (object_ != nullptr) {
            std::exchange(object_, nullptr)->Release();
        }
    }

  private:
    Interface* object_ = nullptr;
};

// The object under another interface; empty when it does not offer it.
template <typename Other>
ComPtr<Other> queryInterface(IUnknown& object, const IID& iid) {
    ComPtr<Other> other;
    void* raw = nullptr;
    if (SUCCEEDED(object.QueryInterface(iid, &raw)) && raw != nullptr) {
        *other.out() = static_cast<Other*>(raw);
    }
    return other;
}

template <typename Interface>
template <typename Other>
ComPtr<Other> ComPtr<Interface>::query(const IID& iid) const {
    return object_ == nullptr ? ComPtr<Other>() : queryInterface<Other>(*object_, iid);
}

}  // namespace corbel

#endif
