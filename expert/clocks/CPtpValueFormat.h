#ifndef QV_EXPERT_CLOCKS_CPTPVALUEFORMAT_H
#define QV_EXPERT_CLOCKS_CPTPVALUEFORMAT_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "ptp/tPortIdentity.h"
#include "ptp/tTimeInterval.h"
#include "ptp/tTimestamp.h"
#include "ptpmgmt/tClockKey.h"
#include "qv1588/qv1588.h"

// How PTP values appear to the host, and item names back to clock keys.
class CPtpValueFormat {
  public:
    // Seconds from 1904-01-01 to 1970-01-01, the start of PTP time.
    static constexpr std::int64_t kSecondsFrom1904To1970 = 2082844800;
    // The last second that the 48 bits of a PTP timestamp hold.
    static constexpr std::int64_t kLastPtpSecond = 0xFFFFFFFFFFFF;

    // Two upper-case hexadecimal digits per octet, joined by `separator`.
    static std::u16string hexOctets(const std::uint8_t* octets, std::size_t count, char separator);
    static std::u16string dottedIPv4(const std::uint8_t* octets);
    // 02-11-22-FF-FE-33-44-55:1, the form of an item name.
    static std::u16string portIdentity(const nQVPTP000::tPortIdentity& port);

    // "%X-%X-%X-%X-%X-%X-%X-%X:%d" with every octet field 0 to 255 (lower case accepted,
    // text after the port ignored) and a port of 0 to 65535 in decimal digits; nothing when
    // the name does not parse.
    static std::optional<nQVPTPMGMT000::tClockKey> clockKeyOf(std::u16string_view name);

    // PTP time to host time: whole seconds moved to 1904, the nanoseconds dropped.
    static kxSysAttrTimestampUTC hostTimeOf(const nQVPTP000::tTimestamp& time);
    // Host time to PTP time: nothing before 1970 or past the 48-bit seconds of PTP; the
    // fraction is dropped.
    static std::optional<nQVPTP000::tTimestamp> ptpTimeOf(const kxSysAttrTimestampUTC& time);

    // Scaled nanoseconds (2^-16 ns) to whole nanoseconds, truncated toward zero.
    static double nanosecondsOf(const nQVPTP000::tTimeInterval& interval);
    // 2 raised to the variance's logarithm taken as unsigned; large ones give infinity.
    static double varianceOf(std::uint16_t scaledLogVariance);

    // A clock's text (user or product description, UTF-8 on the wire) for the host. Never
    // fails: octets that are not UTF-8 become U+FFFD, whatever the locale or code page.
    static std::u16string clockText(std::string_view text);
    // A host text for the wire in UTF-8; nothing for a text that has no UTF-8 form.
    static std::optional<std::string> ptpText(std::u16string_view text);
};

#endif
