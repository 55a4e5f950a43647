#include "corbel/FailureCause.h"

#include <cstdio>

#include "corbel/ComPtr.h"
#include "corbel/ExitCode.h"
#include "corbel/WideText.h"

namespace corbel {

namespace {

constexpr ULONG kNoSuchId = 0x0002;
constexpr ULONG kNotSupported = 0x0006;

struct ManagementError {
    ULONG id;
    const char* name;
    const char* words;
};

// IEEE 1588-2008 Table 72.
constexpr ManagementError kManagementErrors[] = {
    {0x0001, "RESPONSE_TOO_BIG", "the answer would be too big"},
    {kNoSuchId, "NO_SUCH_ID", "not known to this clock"},
    {0x0003, "WRONG_LENGTH", "the request has a length the clock does not accept"},
    {0x0004, "WRONG_VALUE", "a value the clock does not accept"},
    {0x0005, "NOT_SETABLE", "not settable on this clock"},
    {kNotSupported, "NOT_SUPPORTED", "not supported by this clock"},
    {0xFFFE, "GENERAL_ERROR", "a general error of the clock"},
};

const ManagementError* managementError(ULONG id) {
    for (const ManagementError& error : kManagementErrors) {
        if (error.id == id) {
            return &error;
        }
    }
    return nullptr;
}

}  // namespace

FailureCause FailureCause::last(IkxSysExpert2& expert, HRESULT result) {
    FailureCause cause;
    cause.result = result;
    OwnedBstr description;
    OwnedBstr trace;
    if (const auto failures = queryInterface<IkxQvLastFailure2>(expert, IID_IkxQvLastFailure2)) {
        ULONG kind = 0;
        failures->GetLastFailureCause(&kind, &cause.managementErrorId, &cause.tag);
        cause.kind = static_cast<kxQvFailureKind>(kind);
        failures->GetLastFailure(description.out(), trace.out());
    } else if (const auto older = queryInterface<IkxQvLastFailure>(expert, IID_IkxQvLastFailure)) {
        // An expert without the numbers: its words alone.
        if (older->GetLastFailure(description.out(), trace.out()) == S_OK) {
            cause.kind = kxQvFailureKind::other;
        }
    }
    cause.description = description.utf8();
    cause.trace = trace.utf8();
    return cause;
}

bool FailureCause::notSupported() const {
    return kind == kxQvFailureKind::refusedByClock &&
           (managementErrorId == kNotSupported || managementErrorId == kNoSuchId);
}

std::string FailureCause::words() const {
    switch (kind) {
        case kxQvFailureKind::refusedByClock: {
            const ManagementError* error = managementError(managementErrorId);
            char number[16];
            std::snprintf(number, sizeof number, "0x%04lX",
                          static_cast<unsigned long>(managementErrorId));
            return error != nullptr ? error->words
                                    : std::string("refused by the clock with error ") + number;
        }
        case kxQvFailureKind::noAnswer:
            return "no answer from the clock";
        case kxQvFailureKind::invalidValue:
            return "a value that validation rejects";
        case kxQvFailureKind::network:
            return description.empty() ? "the network failed" : description;
        default:
            return description.empty() ? "the expert reports no reason" : description;
    }
}

std::string FailureCause::reason() const {
    return kind == kxQvFailureKind::refusedByClock ? managementErrorName(managementErrorId) : "";
}

std::string FailureCause::internals() const {
    return hresultText(result) + (trace.empty() ? "" : "; " + trace);
}

const char* managementErrorName(ULONG managementErrorId) {
    const ManagementError* error = managementError(managementErrorId);
    return error != nullptr ? error->name : "";
}

}  // namespace corbel
