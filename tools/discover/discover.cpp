// Finds the PTP clock ports that answer management messages on this computer's network and
// prints what the expert shows of each: its item name and its main attributes. It sends
// management GET requests only and changes nothing.
//
// Usage: qv_discover [wait in milliseconds]   (default: the configured findClocksTimeout)

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <vector>

#include "platform/EthernetAdapters.h"
#include "platform/FindClocksTimeout.h"
#include "platform/tStatusReason.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/transport/tUDPNetworkInterface.h"
#include "ptpmgmt/tPTPClockProxy.h"
#include "ptpmgmt/tPTPMgmtNode.h"

using namespace nQVPTP000;
using namespace nQVPTPMGMT000;

namespace {

// The item name of a port: the clock identity's octets as "%.2X" joined by "-", then
// ":%u" with the port number.
void printItemName(const tPortIdentity& port) {
    const tClockIdentity identity = port.getClockIdentity();
    for (std::size_t i = 0; i < tClockIdentity::kSize; ++i) {
        std::printf("%s%.2X", i == 0 ? "" : "-", identity[i]);
    }
    std::printf(":%u\n", port.getPortNumber());
}

void printClock(iPTPClockProxy& proxy) {
    printItemName(proxy.getPortIdentity());
    char text[256];
    tStatus status;
    proxy.getProductDescription(text, sizeof text, status);
    std::printf("  domain %u, product \"%s\"\n", proxy.getDomainNumber(),
                status.succeeded() ? text : "?");

    status.reset();
    const tDefaultDataSetTLV defaults = proxy.getDefaultDataSet(status);
    if (status.succeeded()) {
        const tClockQuality quality = defaults.getClockQuality();
        std::printf(
            "  priority1 %u, priority2 %u, clockClass %u, clockAccuracy 0x%02X, "
            "slaveOnly %s\n",
            defaults.getPriority1(), defaults.getPriority2(), quality.clockClass,
            quality.clockAccuracy, defaults.getSlaveOnly() ? "yes" : "no");
    } else {
        std::printf("  default data set: %d, %s\n", status.code,
                    tStatusReason::describe(status).c_str());
    }

    status.reset();
    const tPortDataSetTLV port = proxy.getPortDataSet(status);
    if (status.succeeded()) {
        std::printf(
            "  portState %u, logSyncInterval %d, logAnnounceInterval %d, "
            "announceReceiptTimeout %u\n",
            port.getPortState(), port.getLogSyncInterval(), port.getLogAnnounceInterval(),
            port.getAnnounceReceiptTimeout());
    }

    status.reset();
    proxy.getUserDescription(text, sizeof text, status);
    std::printf("  userDescription \"%s\"\n", status.succeeded() ? text : "?");
}

}  // namespace

int main(int argc, char** argv) {
    // The wait is a 16-bit count of milliseconds, as the configured one is.
    const unsigned long asked =
        argc > 1 ? std::strtoul(argv[1], nullptr, 10) : qv::dsc::osdep::FindClocksTimeout::read();
    const auto wait = static_cast<std::uint16_t>(asked > 0xFFFF ? 0xFFFF : asked);
    tStatus status;
    tUDPNetworkInterface transport;
    const auto identity = qv::dsc::osdep::EthernetAdapters::localClockIdentity();
    tPTPMgmtNode node(&transport, tClockIdentity(identity.data()),
                      static_cast<std::uint16_t>(getpid() & 0xFFFF), status);
    node.open(status);
    node.findClocks(wait, status);
    if (status.failed()) {
        std::fprintf(stderr, "discovery failed: %d (%s, %s line %u)\n", status.code,
                     status.component, status.file, status.line);
        return 1;
    }
    std::vector<iPTPClockProxy*> proxies(node.clockCount());
    node.copyClockProxies(proxies.data(), static_cast<std::uint16_t>(proxies.size()), status);
    std::printf("%zu clock port(s) found in domains 0 to 3\n", proxies.size());
    for (iPTPClockProxy* proxy : proxies) {
        printClock(*proxy);
    }
    node.close(status);
    return status.succeeded() ? 0 : 1;
}
