#ifndef QV_TESTS_PTP_MESSAGETESTSUPPORT_H
#define QV_TESTS_PTP_MESSAGETESTSUPPORT_H

#include <memory>
#include <string_view>

#include "ptp/tPTPMessage.h"
#include "ptp/tPTPMessageFactory.h"
#include "tests/ptp/PduTestSupport.h"

namespace qvtest {

// What the message factory makes of a datagram given as hex text.
inline std::unique_ptr<nQVPTP000::tPTPMessage> decodeMessage(std::string_view hexText,
                                                             tStatus& status) {
    Datagram datagram(hexText);
    return nQVPTP000::tPTPMessageFactory::createMessage(datagram.unit(), status);
}

// The common header of a received test datagram: transportSpecific 0, the given type and
// length, version 2, domain 0, no flags, correction 0, source 00-1B-21-FF-FE-01-02-03:1,
// sequenceId 0x0102, the given controlField, logMessageInterval 0.
inline std::string headerHex(std::string_view typeOctet, std::string_view lengthOctets,
                             std::string_view controlOctet) {
    std::string text;
    text += typeOctet;
    text += " 02 |";  // reserved | versionPTP 2
    text += lengthOctets;
    text += " | 00 | 00 | 00 00 |";                     // domain | reserved | flags
    text += "00 00 00 00 00 00 00 00 | 00 00 00 00 |";  // correctionField | reserved
    text += "00 1B 21 FF FE 01 02 03 | 00 01 |";        // sourcePortIdentity
    text += "01 02 |";                                  // sequenceId
    text += controlOctet;
    text += " | 00 |";  // controlField | logMessageInterval
    return text;
}

// The body of a received management message: target all ports of all clocks, hops 0, the
// given actionField octet, reserved.
inline std::string managementBodyHex(std::string_view actionOctet = "02") {
    std::string text = "FF FF FF FF FF FF FF FF | FF FF | 00 | 00 |";
    text += actionOctet;
    text += " | 00 |";
    return text;
}

}  // namespace qvtest

#endif
