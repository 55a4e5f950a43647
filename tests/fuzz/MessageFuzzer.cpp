// Feeds arbitrary datagrams to the message factory, as the receive thread does with whatever
// arrives on the PTP ports. Every message that decodes is also traced and written back, so
// that the whole life of a received message runs on hostile input.

#include <cstddef>
#include <cstdint>

#include "platform/DebugOutput.h"
#include "platform/iTraceDestination.h"
#include "platform/tTrace.h"
#include "ptp/tPTPMessageFactory.h"
#include "ptp/tProtocolDataUnit.h"

namespace {

// Throws the trace away after touching every octet, so that what a trace reads is checked.
class tDiscardingDestination final : public nQVTARN000::iTraceDestination {
  public:
    void write(const char* text, std::size_t length) override {
        for (std::size_t i = 0; i < length; ++i) {
            sum_ += static_cast<unsigned char>(text[i]);
        }
    }
    void write(const char* text) override {
        while (*text != '\0') {
            sum_ += static_cast<unsigned char>(*text++);
        }
    }

  private:
    unsigned sum_ = 0;
};

void discardDebugOutput(const char*, void*) {}

}  // namespace

// The codec reports unsupported organizations on the debug output: silenced here.
extern "C" int LLVMFuzzerInitialize(int*, char***) {
    nQVTARN000::setDebugOutputSink({&discardDebugOutput, nullptr});
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    tStatus status;
    nQVPTP000::tProtocolDataUnit datagram(status);
    datagram.writeOctets(data, size, status);
    const auto message = nQVPTP000::tPTPMessageFactory::createMessage(datagram, status);
    if (!message) {
        return 0;
    }
    tDiscardingDestination destination;
    nQVTARN000::tTrace trace(&destination);
    trace.beginLine("fuzz", 0, "fuzz", 0, 0).append(*message).endLine();

    tStatus writeStatus;
    nQVPTP000::tProtocolDataUnit written(writeStatus);
    message->serialize(written, writeStatus);
    return 0;
}
