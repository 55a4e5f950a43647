#ifndef QV_TESTS_CORBEL_SERVE_CHILDPROCESS_H
#define QV_TESTS_CORBEL_SERVE_CHILDPROCESS_H

#include <sys/types.h>

#include <string>
#include <vector>

namespace qvtest {

// A program run in the background, its standard output and error into `logFile`, ended
// with SIGTERM at the latest when this object goes.
class ChildProcess {
  public:
    ChildProcess(const std::vector<std::string>& arguments, const std::string& logFile);
    ~ChildProcess() { stop(); }
    ChildProcess(const ChildProcess&) = delete;
    ChildProcess& operator=(const ChildProcess&) = delete;

    pid_t pid() const { return pid_; }
    // Sends SIGTERM and waits: the exit code, -1 when it did not end normally.
    int stop();

  private:
    pid_t pid_ = -1;
    int status_ = -1;
};

}  // namespace qvtest

#endif
