#include "expert/clocks/CPtpValueFormat.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "platform/CodePage.h"
#include "platform/Exception.h"

namespace {

void appendAscii(std::u16string& target, const char* text) {
    for (; *text != '\0'; ++text) {
        target.push_back(static_cast<char16_t>(*text));
    }
}

// At most five decimal digits that make a number up to 65535.
bool parsePort(const char* digits, unsigned long& port) {
    const std::size_t length = std::strlen(digits);
    if (length == 0 || length > 5) {
        return false;
    }
    port = std::strtoul(digits, nullptr, 10);
    return port <= 0xFFFF;
}

}  // namespace

std::u16string CPtpValueFormat::hexOctets(const std::uint8_t* octets, std::size_t count,
                                          char separator) {
    std::u16string text;
    for (std::size_t i = 0; i < count; ++i) {
        char digits[4];
        std::snprintf(digits, sizeof digits, "%.2X", octets[i]);
        if (i != 0) {
            text.push_back(static_cast<char16_t>(separator));
        }
        appendAscii(text, digits);
    }
    return text;
}

std::u16string CPtpValueFormat::dottedIPv4(const std::uint8_t* octets) {
    char text[16];
    std::snprintf(text, sizeof text, "%u.%u.%u.%u", octets[0], octets[1], octets[2], octets[3]);
    std::u16string result;
    appendAscii(result, text);
    return result;
}

std::u16string CPtpValueFormat::portIdentity(const nQVPTP000::tPortIdentity& port) {
    const nQVPTP000::tClockIdentity identity = port.getClockIdentity();
    std::u16string text = hexOctets(identity.getOctets(), nQVPTP000::tClockIdentity::kSize, '-');
    appendAscii(text, (":" + std::to_string(port.getPortNumber())).c_str());
    return text;
}

std::optional<nQVPTPMGMT000::tClockKey> CPtpValueFormat::clockKeyOf(std::u16string_view name) {
    // Only ASCII can belong to a name; anything else stops the scan where it stands.
    std::string narrow;
    for (const char16_t unit : name) {
        narrow.push_back(unit < 0x80 ? static_cast<char>(unit) : '?');
    }
    unsigned fields[8] = {};
    char port[8] = {};
    const int converted =
        std::sscanf(narrow.c_str(), "%X-%X-%X-%X-%X-%X-%X-%X:%7[0-9]", &fields[0], &fields[1],
                    &fields[2], &fields[3], &fields[4], &fields[5], &fields[6], &fields[7], port);
    // The port is a decimal number of 16 bits: "65537" or "-65535" must not wrap to port 1.
    unsigned long portNumber = 0;
    if (converted != 9 || !parsePort(port, portNumber)) {
        return std::nullopt;
    }
    nQVPTPMGMT000::tClockKey key{};
    for (std::size_t i = 0; i < 8; ++i) {
        if (fields[i] > 0xFF) {
            return std::nullopt;
        }
        key[i] = static_cast<std::uint8_t>(fields[i]);
    }
    key[8] = static_cast<std::uint8_t>(portNumber >> 8);
    key[9] = static_cast<std::uint8_t>(portNumber & 0xFF);
    return key;
}

kxSysAttrTimestampUTC CPtpValueFormat::hostTimeOf(const nQVPTP000::tTimestamp& time) {
    // PTP seconds have 48 bits: the sum always fits.
    return {0, static_cast<std::int64_t>(time.getSeconds()) + kSecondsFrom1904To1970};
}

std::optional<nQVPTP000::tTimestamp> CPtpValueFormat::ptpTimeOf(const kxSysAttrTimestampUTC& time) {
    // Signed: a time before 1904 must not wrap into a huge count of seconds.
    if (time.seconds < kSecondsFrom1904To1970 ||
        time.seconds - kSecondsFrom1904To1970 > kLastPtpSecond) {
        return std::nullopt;
    }
    return nQVPTP000::tTimestamp(static_cast<std::uint64_t>(time.seconds - kSecondsFrom1904To1970),
                                 0);
}

double CPtpValueFormat::nanosecondsOf(const nQVPTP000::tTimeInterval& interval) {
    return static_cast<double>(interval.getScaledNanoseconds() / 65536);
}

double CPtpValueFormat::varianceOf(std::uint16_t scaledLogVariance) {
    return std::ldexp(1.0, scaledLogVariance);
}

std::u16string CPtpValueFormat::clockText(std::string_view text) {
    try {
        return qv::dsc::AnsiToWide(text, "UTF-8");
    } catch (const qv::dsc::exception::Exception&) {
        // The converter itself could not be made: keep what ASCII there is.
        std::u16string result;
        for (const char octet : text) {
            const auto unit = static_cast<unsigned char>(octet);
            result.push_back(unit < 0x80 ? static_cast<char16_t>(unit) : u'\uFFFD');
        }
        return result;
    }
}

std::optional<std::string> CPtpValueFormat::ptpText(std::u16string_view text) {
    try {
        return qv::dsc::WideToAnsi(text, "UTF-8");
    } catch (const qv::dsc::exception::Exception&) {
        return std::nullopt;  // a lone surrogate has no UTF-8 form
    }
}
