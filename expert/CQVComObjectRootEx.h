#ifndef QV_EXPERT_CQVCOMOBJECTROOTEX_H
#define QV_EXPERT_CQVCOMOBJECTROOTEX_H

#include <atomic>

#include "expert/CQVComObjectRootBase.h"
#include "qv1588/corbel.h"

// The reference count of a host object, changed as ThreadModel says. Host classes derive
// from it virtually, so that a class with several interface chains still has one count.
template <class ThreadModel>
class CQVComObjectRootEx : public CQVComObjectRootBase {
  public:
    ULONG InternalAddRef() noexcept { return ThreadModel::Increment(count_); }
    ULONG InternalRelease() noexcept { return ThreadModel::Decrement(count_); }

  protected:
    CQVComObjectRootEx() = default;
    ~CQVComObjectRootEx() = default;

    std::atomic<ULONG> count_{0};
};

#endif
