#ifndef QV_TESTS_SUPPORT_FAILINGALLOCATION_H
#define QV_TESTS_SUPPORT_FAILINGALLOCATION_H

namespace qvtest {

// While alive, the `nth` allocation through operator new on the calling thread (1 = the
// next one) throws std::bad_alloc, as a machine out of memory would. The program that uses
// it replaces the global operator new; everything else allocates normally.
class ScopedAllocationFailure {
  public:
    explicit ScopedAllocationFailure(unsigned nth);
    ~ScopedAllocationFailure();
    ScopedAllocationFailure(const ScopedAllocationFailure&) = delete;
    ScopedAllocationFailure& operator=(const ScopedAllocationFailure&) = delete;

    // Whether the planned failure has happened.
    bool triggered() const;
};

// While alive, a planned failure waits: allocations on the calling thread neither fail nor
// count. For test doubles that stand for another machine, whose memory is not the one
// under test.
class AllocationFailurePause {
  public:
    AllocationFailurePause();
    ~AllocationFailurePause();
    AllocationFailurePause(const AllocationFailurePause&) = delete;
    AllocationFailurePause& operator=(const AllocationFailurePause&) = delete;

  private:
    unsigned saved_;
};

}  // namespace qvtest

#endif
