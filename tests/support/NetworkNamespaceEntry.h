#ifndef QV_TESTS_SUPPORT_NETWORKNAMESPACEENTRY_H
#define QV_TESTS_SUPPORT_NETWORKNAMESPACEENTRY_H

#include <string>

namespace qvtest {

// Moves the calling thread into the named network namespace (/run/netns/NAME) while alive,
// and back into the thread's previous one on destruction.
//
// How network tests use it: the namespace is a property of each thread, not of the
// process, so only the thread that made this object is moved. Sockets keep the namespace in
// which they were created, and threads inherit the namespace of the thread that creates
// them. So a test makes this object first, then constructs the object under test (its
// sockets and its receive thread are then in the client namespace), and may let the entry
// go once everything is created; the gtest main thread returns to the machine's namespace
// at the end of the scope. Threads that existed before (gtest's, a pool's) stay where they
// were.
class NetworkNamespaceEntry {
  public:
    explicit NetworkNamespaceEntry(const std::string& nameSpace);
    ~NetworkNamespaceEntry();
    NetworkNamespaceEntry(const NetworkNamespaceEntry&) = delete;
    NetworkNamespaceEntry& operator=(const NetworkNamespaceEntry&) = delete;

    // Whether the thread is in the named namespace; otherwise failure() says why.
    bool entered() const { return entered_; }
    const std::string& failure() const { return failure_; }

  private:
    int previous_ = -1;  // descriptor of the thread's namespace before entry
    bool entered_ = false;
    std::string failure_;
};

}  // namespace qvtest

#endif
