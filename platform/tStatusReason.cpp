#include "platform/tStatusReason.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

#include "platform/WinError.h"

namespace {

constexpr std::size_t kTextWord = 2;

// managementErrorId names of IEEE 1588-2008, table 72.
const char* errorName(std::uint64_t managementErrorId) {
    switch (managementErrorId) {
        case 0x0001:
            return "RESPONSE_TOO_BIG";
        case 0x0002:
            return "NO_SUCH_ID";
        case 0x0003:
            return "WRONG_LENGTH";
        case 0x0004:
            return "WRONG_VALUE";
        case 0x0005:
            return "NOT_SETABLE";
        case 0x0006:
            return "NOT_SUPPORTED";
        case 0xFFFE:
            return "GENERAL_ERROR";
        default:
            return nullptr;
    }
}

}  // namespace

bool tStatusReason::carries(const tStatus& status) noexcept {
    return status.structSize >= tStatus::kFullSize && status.failed();
}

void tStatusReason::record(tStatus& status, tKind kind, std::uint64_t number) noexcept {
    if (carries(status)) {
        std::fill(std::begin(status.extension), std::end(status.extension), 0);
        status.extension[0] = static_cast<std::uint64_t>(kind);
        status.extension[1] = number;
    }
}

void tStatusReason::refused(tStatus& status, std::uint16_t managementErrorId,
                            std::string_view displayText) noexcept {
    record(status, tKind::kRefused, managementErrorId);
    keepText(status, displayText);
}

void tStatusReason::systemCall(tStatus& status, std::string_view call, int systemError) noexcept {
    record(status, tKind::kSystemCall, static_cast<std::uint64_t>(systemError));
    keepText(status, call);
}

void tStatusReason::keepText(tStatus& status, std::string_view text) noexcept {
    if (carries(status) && !text.empty()) {
        std::memcpy(&status.extension[kTextWord], text.data(),
                    std::min(text.size(), kTextSize - 1));
    }
}

void tStatusReason::noAnswer(tStatus& status, std::uint32_t timeoutMs) noexcept {
    record(status, tKind::kNoAnswer, timeoutMs);
}

void tStatusReason::wrongAnswer(tStatus& status, std::uint32_t actionField,
                                std::uint16_t managementId) noexcept {
    record(status, tKind::kWrongAnswer, std::uint64_t{actionField} << 16 | managementId);
}

void tStatusReason::badDatagram(tStatus& status, std::uint64_t length) noexcept {
    record(status, tKind::kBadDatagram, length);
}

tStatusReason::tKind tStatusReason::kindOf(const tStatus& status) noexcept {
    return carries(status) ? static_cast<tKind>(status.extension[0]) : tKind::kNone;
}

std::uint64_t tStatusReason::numberOf(const tStatus& status) noexcept {
    return kindOf(status) == tKind::kNone ? 0 : status.extension[1];
}

std::string_view tStatusReason::textOf(const tStatus& status) noexcept {
    if (kindOf(status) == tKind::kNone) {
        return {};
    }
    const char* text = reinterpret_cast<const char*>(&status.extension[kTextWord]);
    return std::string_view(text, strnlen(text, kTextSize - 1));
}

std::string tStatusReason::describe(const tStatus& status) {
    const std::uint64_t number = numberOf(status);
    char line[96];
    switch (kindOf(status)) {
        case tKind::kRefused:
            if (const char* name = errorName(number)) {
                std::snprintf(line, sizeof line, "refused by the clock: %s", name);
            } else {
                std::snprintf(line, sizeof line, "refused by the clock: error 0x%04llX",
                              static_cast<unsigned long long>(number));
            }
            return textOf(status).empty() ? line
                                          : line + (" (" + std::string(textOf(status)) + ")");
        case tKind::kNoAnswer:
            std::snprintf(line, sizeof line, "no answer within %llu ms",
                          static_cast<unsigned long long>(number));
            return line;
        case tKind::kWrongAnswer:
            std::snprintf(line, sizeof line,
                          "answer of the wrong kind (actionField %llu, managementId 0x%04llX)",
                          static_cast<unsigned long long>(number >> 16),
                          static_cast<unsigned long long>(number & 0xFFFF));
            return line;
        case tKind::kBadDatagram:
            std::snprintf(line, sizeof line, "datagram of %llu octets dropped",
                          static_cast<unsigned long long>(number));
            return line;
        case tKind::kSystemCall:
            return std::string(textOf(status)) +
                   " failed: " + qv::dsc::osdep::WinError::messageOf(static_cast<int>(number));
        default:
            return {};
    }
}
