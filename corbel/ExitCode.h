#ifndef QV_CORBEL_EXITCODE_H
#define QV_CORBEL_EXITCODE_H

#include <qv1588/qv1588.h>

#include <string>

namespace corbel {

// How a run of corbel ended; scripts rely on these numbers, so they never change.
enum class ExitCode : int {
    kSuccess = 0,
    kNothingFound = 1,  // no clock answered, or none answers to the item name
    kBadUsage = 2,      // unknown command, option, tag name or value that does not parse
    kRejected = 3,      // the expert's validation rejected a value (its sentences are shown)
    kFailed = 4,        // the clock refused a request, did not answer, or discovery failed
    kNoExpert = 5,      // the expert library cannot be loaded or started
};

// The exit code of an item operation's result and the kind of failure the expert recorded
// for it: S_FALSE from a discovery is "nothing found" unless the discovery itself failed.
ExitCode exitCodeOf(HRESULT result, kxQvFailureKind kind);

// The worse of two outcomes, for a command over several items: a failure outweighs
// "nothing found", which outweighs success.
ExitCode worse(ExitCode left, ExitCode right);

// "0x80004005".
std::string hresultText(HRESULT result);

inline int toInt(ExitCode code) {
    return static_cast<int>(code);
}

}  // namespace corbel

#endif
