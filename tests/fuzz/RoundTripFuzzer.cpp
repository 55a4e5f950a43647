// Checks that what the message factory decodes is written back the same: whatever decodes
// encodes to octets that decode again, to the same values (the same trace), and that encode
// to the same octets once more. A received message that the client copies, clones or answers
// is written by the same code, so any difference here is a malformed datagram sent.

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>

#include "platform/DebugOutput.h"
#include "platform/iTraceDestination.h"
#include "platform/tTrace.h"
#include "ptp/tPTPMessage.h"
#include "ptp/tPTPMessageFactory.h"
#include "ptp/tProtocolDataUnit.h"

namespace {

// Keeps the trace text, so that two decodings can be compared value by value.
class tTextDestination final : public nQVTARN000::iTraceDestination {
  public:
    void write(const char* text, std::size_t length) override { text_.append(text, length); }
    void write(const char* text) override { text_.append(text); }
    const std::string& text() const { return text_; }

  private:
    std::string text_;
};

void discardDebugOutput(const char*, void*) {}

std::string traceOf(const nQVPTP000::tPTPMessage& message) {
    tTextDestination destination;
    nQVTARN000::tTrace trace(&destination);
    trace.beginLine("fuzz", 0, "fuzz", 0, 0).append(message).endLine();
    return destination.text();
}

std::unique_ptr<nQVPTP000::tPTPMessage> decode(const std::uint8_t* data, std::size_t size,
                                               tStatus& status) {
    nQVPTP000::tProtocolDataUnit datagram(status);
    datagram.writeOctets(data, size, status);
    return nQVPTP000::tPTPMessageFactory::createMessage(datagram, status);
}

// A message that cannot be written (its sizes overflow a 16-bit length) is no round trip:
// written stays empty then.
std::string encode(const nQVPTP000::tPTPMessage& message) {
    tStatus status;
    nQVPTP000::tProtocolDataUnit written(status);
    message.serialize(written, status);
    if (status.failed()) {
        return {};
    }
    return std::string(reinterpret_cast<const char*>(written.getBuffer()),
                       static_cast<std::size_t>(written.getLength()));
}

[[noreturn]] void fail(const char* what) {
    std::fprintf(stderr, "round trip: %s\n", what);
    std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    nQVTARN000::setDebugOutputSink({&discardDebugOutput, nullptr});
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    tStatus status;
    const auto first = decode(data, size, status);
    if (!first) {
        return 0;
    }
    const std::string written = encode(*first);
    if (written.empty()) {
        return 0;
    }
    tStatus again;
    const auto second =
        decode(reinterpret_cast<const std::uint8_t*>(written.data()), written.size(), again);
    if (!second) {
        fail("the octets written do not decode");
    }
    // The trace of the first is taken after its encoding, which sets messageLength.
    if (traceOf(*first) != traceOf(*second)) {
        fail("the octets written decode to other values");
    }
    if (encode(*second) != written) {
        fail("the decoded copy encodes to other octets");
    }
    return 0;
}
