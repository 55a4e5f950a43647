#ifndef QV_EXPERT_CLOCKS_CPTPLASTFAILURE_H
#define QV_EXPERT_CLOCKS_CPTPLASTFAILURE_H

#include <string>

#include "platform/tStatus.h"
#include "qv1588/qv1588.h"

// The calling thread's record of why its last expert operation failed (IkxQvLastFailure and
// IkxQvLastFailure2). A host reads it on the thread that made the failing call, as with COM's
// error objects; the record is the thread's own, so threads never see each other's failures.
class CPtpLastFailure {
  public:
    // Every item operation starts with an empty record.
    static void clear() noexcept;
    // `what` says which step failed; the status says where and why, and so the kind of the
    // failure (a status without an error leaves `what` alone as the description, kind other).
    // `tag`: the tag whose write failed, if any.
    static void record(const char* what, const tStatus& status, kxSysAttributeTagID tag = 0);
    // ApplyChanges met a value that validation rejects: `sentence` says why.
    static void recordInvalid(kxSysAttributeTagID tag, const std::u16string& sentence);

    static HRESULT get(BSTR* description, BSTR* trace);
    static HRESULT getCause(ULONG* kind, ULONG* managementErrorId, kxSysAttributeTagID* tag);

    // "[component--line--file------...] code": the trace header of the place that failed.
    static std::string traceLineOf(const tStatus& status);
};

#endif
