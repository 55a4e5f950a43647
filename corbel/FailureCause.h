#ifndef QV_CORBEL_FAILURECAUSE_H
#define QV_CORBEL_FAILURECAUSE_H

#include <qv1588/qv1588.h>

#include <string>

namespace corbel {

// Why an operation of the expert failed, as the expert recorded it for the calling thread
// (IkxQvLastFailure2), in words for a person and in numbers for a decision.
struct FailureCause {
    HRESULT result = S_OK;  // what the operation returned
    kxQvFailureKind kind = kxQvFailureKind::none;
    ULONG managementErrorId = 0;  // the clock's reason when it refused
    kxSysAttributeTagID tag = 0;  // where ApplyChanges stopped
    std::string description;      // the expert's words: the step and the reason
    std::string trace;            // the expert's internal line of the failure

    // What the expert recorded for the calling thread's last operation, which returned
    // `result`. Read it before the next call into the expert.
    static FailureCause last(IkxSysExpert2& expert, HRESULT result);
    // A failure that the expert did not record (kind none).
    static FailureCause of(HRESULT result) {
        FailureCause cause;
        cause.result = result;
        return cause;
    }

    // The clock answered that it has no such data or does not support it: a normal answer
    // of a clock that implements less than all of IEEE 1588, not a fault.
    bool notSupported() const;

    // In words: "not supported by this clock", "no answer from the clock", ...
    std::string words() const;
    // The clock's reason as IEEE 1588 names it ("NOT_SUPPORTED"), empty unless it refused.
    std::string reason() const;
    // The numbers behind it, for --verbose: "0x80004005; [component--line--file] -52012".
    std::string internals() const;
};

// IEEE 1588-2008 Table 72: "NOT_SUPPORTED" for 6; empty for a value it does not list.
const char* managementErrorName(ULONG managementErrorId);

}  // namespace corbel

#endif
