#include "expert/clocks/CPtpLastFailure.h"

#include <cstring>
#include <optional>

#include "platform/BStr.h"
#include "platform/tStatusReason.h"

namespace {

constexpr std::size_t kHeaderWidth = 49;

struct tFailure {
    std::u16string description;
    std::u16string trace;
    kxQvFailureKind kind = kxQvFailureKind::other;
    ULONG managementErrorId = 0;
    kxSysAttributeTagID tag = 0;
};

thread_local std::optional<tFailure> lastFailure;

std::u16string widened(const std::string& text) {
    return std::u16string(text.begin(), text.end());
}

kxQvFailureKind kindOf(const tStatus& status) {
    switch (tStatusReason::kindOf(status)) {
        case tStatusReason::tKind::kRefused:
            return kxQvFailureKind::refusedByClock;
        case tStatusReason::tKind::kNoAnswer:
        case tStatusReason::tKind::kWrongAnswer:
            return kxQvFailureKind::noAnswer;
        case tStatusReason::tKind::kSystemCall:
            return kxQvFailureKind::network;
        default:
            break;
    }
    switch (status.code) {
        case kStatusNoData:
            return kxQvFailureKind::noAnswer;
        case kStatusSocketError:
        case kStatusOsObjectError:
            return kxQvFailureKind::network;
        default:
            return kxQvFailureKind::other;
    }
}

// The exchange's own reason when it carries one ("refused by the clock: NOT_SUPPORTED").
std::string causeOf(const tStatus& status) {
    const std::string reason = tStatusReason::describe(status);
    if (!reason.empty()) {
        return reason;
    }
    switch (status.code) {
        case kStatusNoData:
            return "no valid answer came from the clock";
        case kStatusSocketError:
            return "the network refused a send or a receive";
        case kStatusNoMemory:
            return "memory ran out";
        case kStatusOsObjectError:
            return "an operating-system object could not be made";
        default:
            return "the exchange failed";
    }
}

void deliver(const std::u16string& text, BSTR* out) {
    if (out != nullptr) {
        *out = qv::dsc::BStr::allocate(text.c_str());
    }
}

}  // namespace

void CPtpLastFailure::clear() noexcept {
    lastFailure.reset();
}

void CPtpLastFailure::record(const char* what, const tStatus& status, kxSysAttributeTagID tag) {
    if (status.code == 0) {
        lastFailure = tFailure{widened(what), u"", kxQvFailureKind::other, 0, tag};
        return;
    }
    const kxQvFailureKind kind = kindOf(status);
    const auto errorId = kind == kxQvFailureKind::refusedByClock
                             ? static_cast<ULONG>(tStatusReason::numberOf(status))
                             : 0;
    lastFailure = tFailure{widened(std::string(what) + ": " + causeOf(status)),
                           widened(traceLineOf(status)), kind, errorId, tag};
}

void CPtpLastFailure::recordInvalid(kxSysAttributeTagID tag, const std::u16string& sentence) {
    const kxQvAttribute* row = kxQvFindAttribute(tag);
    std::u16string description = u"not written, the value of " +
                                 widened(row != nullptr ? row->name : "a tag") +
                                 u" is not valid: " + sentence;
    while (!description.empty() && description.back() == u' ') {
        description.pop_back();
    }
    lastFailure = tFailure{description, u"", kxQvFailureKind::invalidValue, 0, tag};
}

HRESULT CPtpLastFailure::get(BSTR* description, BSTR* trace) {
    for (BSTR* out : {description, trace}) {
        if (out != nullptr) {
            *out = nullptr;
        }
    }
    if (!lastFailure) {
        return S_FALSE;
    }
    deliver(lastFailure->description, description);
    deliver(lastFailure->trace, trace);
    return S_OK;
}

HRESULT CPtpLastFailure::getCause(ULONG* kind, ULONG* managementErrorId, kxSysAttributeTagID* tag) {
    const tFailure none{u"", u"", kxQvFailureKind::none, 0, 0};
    const tFailure& failure = lastFailure ? *lastFailure : none;
    if (kind != nullptr) {
        *kind = static_cast<ULONG>(failure.kind);
    }
    if (managementErrorId != nullptr) {
        *managementErrorId = failure.managementErrorId;
    }
    if (tag != nullptr) {
        *tag = failure.tag;
    }
    return lastFailure ? S_OK : S_FALSE;
}

std::string CPtpLastFailure::traceLineOf(const tStatus& status) {
    const auto field = [](const char* text, std::size_t size) {
        return std::string(text, strnlen(text, size));
    };
    std::string header = "[" + field(status.component, tStatus::kComponentSize) + "--" +
                         std::to_string(status.line) + "--" +
                         field(status.file, tStatus::kFileSize);
    if (header.size() < kHeaderWidth) {
        header.append(kHeaderWidth - header.size(), '-');
    }
    return header + "] " + std::to_string(status.code);
}
