#ifndef QV_CORBEL_EXITCODE_H
#define QV_CORBEL_EXITCODE_H

#include <qv1588/corbel.h>

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

// The exit code for a failed result of an item operation.
ExitCode exitCodeOf(HRESULT result);

// "0x80004005".
std::string hresultText(HRESULT result);

inline int toInt(ExitCode code) {
    return static_cast<int>(code);
}

}  // namespace corbel

#endif
