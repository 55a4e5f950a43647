#ifndef QV_PLATFORM_TSTATUSREASON_H
#define QV_PLATFORM_TSTATUSREASON_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "platform/tStatus.h"

// Why a recorded failure happened, carried in the extension words of the status record, so
// that one code (-52012 for every failed exchange) can still tell a refusal from silence.
// Word 0 holds the kind, word 1 a number that depends on the kind, words 2 to 9 a text of
// at most 63 octets with its terminating zero. Recording a new code clears the kind; merge
// carries the words along. A record that is not full-size, or holds no failure, carries no
// reason.
class tStatusReason {
  public:
    enum class tKind : std::uint64_t {
        kNone = 0,
        kRefused = 1,      // number: the clock's managementErrorId; text: its displayData
        kNoAnswer = 2,     // number: the time-out in milliseconds
        kWrongAnswer = 3,  // number: the answer's actionField << 16 | its managementId
        kBadDatagram = 4,  // number: the datagram's length; the socket itself is sound
        kSystemCall = 5,   // number: the system's error number; text: the call that failed
    };
    static constexpr std::size_t kTextSize = 8 * (tStatus::kExtensionWords - 2);

    static void refused(tStatus& status, std::uint16_t managementErrorId,
                        std::string_view displayText) noexcept;
    static void noAnswer(tStatus& status, std::uint32_t timeoutMs) noexcept;
    static void wrongAnswer(tStatus& status, std::uint32_t actionField,
                            std::uint16_t managementId) noexcept;
    static void badDatagram(tStatus& status, std::uint64_t length) noexcept;
    // A call to the operating system failed: `call` names it ("bind to UDP port 319"),
    // `systemError` is errno (on Windows the system's own number).
    static void systemCall(tStatus& status, std::string_view call, int systemError) noexcept;

    static tKind kindOf(const tStatus& status) noexcept;
    static std::uint64_t numberOf(const tStatus& status) noexcept;
    // The text as stored: cut to kTextSize - 1 octets, not converted.
    static std::string_view textOf(const tStatus& status) noexcept;

    // The reason in words, e.g. "refused by the clock: NOT_SUPPORTED", "no answer within
    // 5000 ms" or "sendto failed: Network is unreachable"; empty when the record carries no
    // reason.
    static std::string describe(const tStatus& status);

  private:
    static void keepText(tStatus& status, std::string_view text) noexcept;
    static bool carries(const tStatus& status) noexcept;
    static void record(tStatus& status, tKind kind, std::uint64_t number) noexcept;
};

#endif
