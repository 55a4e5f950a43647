#ifndef QV_TESTS_PTP_CODECTESTSUPPORT_H
#define QV_TESTS_PTP_CODECTESTSUPPORT_H

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/tTrace.h"
#include "ptp/iPTPSerializable.h"
#include "ptp/tPTPMessageFactory.h"
#include "ptp/tProtocolDataUnit.h"
#include "tests/support/Hex.h"
#include "tests/support/TraceCapture.h"

namespace qvtest {

// The octets an object writes, as hex text ("0B 02 ...").
inline std::string encode(const nQVPTP000::iPTPSerializable& object) {
    tStatus status;
    nQVPTP000::tProtocolDataUnit unit(status);
    object.serialize(unit, status);
    if (status.failed()) {
        return "serialize failed: " + std::to_string(status.code);
    }
    return hexText(unit.getBuffer(), static_cast<std::size_t>(unit.getLength()));
}

// Hex text in the form `encode` gives, from a vector commented with "|" between fields.
inline std::string hex(std::string_view commented) {
    return hexText(hexOctets(commented));
}

// A unit holding the given octets, positioned at its start.
class Datagram {
  public:
    explicit Datagram(std::string_view hex) : unit_(status_) {
        const auto octets = hexOctets(hex);
        unit_.writeOctets(octets.data(), octets.size(), status_);
    }
    nQVPTP000::tProtocolDataUnit& unit() { return unit_; }

  private:
    tStatus status_;
    nQVPTP000::tProtocolDataUnit unit_;
};

// What the message factory makes of a datagram given as hex text.
inline std::unique_ptr<nQVPTP000::tPTPMessage> decodeMessage(std::string_view hexText,
                                                             tStatus& status) {
    Datagram datagram(hexText);
    return nQVPTP000::tPTPMessageFactory::createMessage(datagram.unit(), status);
}

// What an object's trace appends, without any header.
inline std::string traceText(const nQVTARN000::iTraceable& object) {
    RecordingDestination destination;
    nQVTARN000::tTrace trace(&destination);
    trace.append(object);
    trace.endLine();
    std::string text = destination.text();
    text.pop_back();  // the line end that endLine added
    return text;
}

}  // namespace qvtest

#endif
