#ifndef QV_TESTS_PTP_FIELDSASTSHARK_H
#define QV_TESTS_PTP_FIELDSASTSHARK_H

#include <string>

#include "ptp/tPTPMessage.h"
#include "tests/support/TsharkDecode.h"

namespace qvtest {

// What the codec holds for a message, read through its getters and named as tshark names
// the fields ("ptp.v2.mm.priority1"): a sample of each TLV's fields, as the round trip of
// every datagram holds the rest to their octets. Which getter answers which field is the one
// fact this table states; the values themselves come from the message.
TsharkFields fieldsAsTshark(const nQVPTP000::tPTPMessage& message);

// One form for a value shown by tshark or by `fieldsAsTshark`: numbers (decimal, negative
// or 0x-hex) as their 64-bit two's complement in decimal, anything else as it stands.
std::string comparable(const std::string& shown);

}  // namespace qvtest

#endif
