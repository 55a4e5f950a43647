#include "ptp/tPortAddress.h"

#include <algorithm>
#include <cstring>

#include "platform/tTrace.h"

namespace nQVPTP000 {

tPortAddress::tPortAddress(std::uint16_t networkProtocol, std::uint16_t addressLength,
                           const std::uint8_t* address, tStatus& status)
    : networkProtocol_(networkProtocol), addressLength_(address == nullptr ? 0 : addressLength) {
    if (addressLength_ > kMaxAddressLength) {
        QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
    }
    if (status.succeeded() && addressLength_ != 0) {
        std::memcpy(addressField_.data(), address, addressLength_);
    }
    if (status.failed()) {
        addressLength_ = 0;
    }
}

tPortAddress::tPortAddress(const tPortAddress& other)
    : networkProtocol_(other.networkProtocol_), addressLength_(other.addressLength_) {
    std::memcpy(addressField_.data(), other.addressField_.data(), addressLength_);
}

tPortAddress& tPortAddress::operator=(const tPortAddress& other) {
    networkProtocol_ = other.networkProtocol_;
    addressLength_ = other.addressLength_;
    std::memcpy(addressField_.data(), other.addressField_.data(), addressLength_);
    return *this;
}

bool tPortAddress::operator==(const tPortAddress& other) const {
    return networkProtocol_ == other.networkProtocol_ && addressLength_ == other.addressLength_ &&
           std::memcmp(addressField_.data(), other.addressField_.data(), addressLength_) == 0;
}

void tPortAddress::trace(nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("networkProtocol: %#.4x ", networkProtocol_);
    trace.appendFormatted("addressLength: %u ", addressLength_);
    trace.append("addressField: ");
    for (std::uint16_t i = 0; i < addressLength_; ++i) {
        trace.appendFormatted("%.2x", addressField_[i]);
    }
}

void tPortAddress::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeEnumeration16(networkProtocol_, status);
    target.writeUInteger16(addressLength_, status);
    target.writeOctets(addressField_.data(), addressLength_, status);
}

void tPortAddress::deserialize(iSerializableTarget& source, tStatus& status) {
    std::uint16_t protocol = 0;
    std::uint16_t length = 0;
    source.readEnumeration16(protocol, status);
    source.readUInteger16(length, status);
    if (status.succeeded() && length > kMaxAddressLength) {
        // No standard address is this long and the room cannot hold it: its octets are read
        // past, so that what follows the address is still read where it is, and the address
        // becomes unknown rather than a part of itself.
        std::array<std::uint8_t, kMaxAddressLength> discarded{};
        for (std::uint16_t left = length; left > 0 && status.succeeded();) {
            const auto count = std::min<std::uint16_t>(left, kMaxAddressLength);
            source.readOctets(discarded.data(), count, status);
            left = static_cast<std::uint16_t>(left - count);
        }
        if (status.succeeded()) {
            *this = tPortAddress();
        }
        return;
    }
    std::array<std::uint8_t, kMaxAddressLength> address{};
    source.readOctets(address.data(), length, status);
    if (status.succeeded()) {
        networkProtocol_ = protocol;
        addressLength_ = length;
        addressField_ = address;
    }
}

}  // namespace nQVPTP000
