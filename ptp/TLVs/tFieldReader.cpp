#include "ptp/TLVs/tFieldReader.h"

#include <algorithm>
#include <new>

namespace nQVPTP000 {

namespace {
constexpr std::size_t kBlock = 64;
}

void tFieldReader::reserved(unsigned octets) {
    std::uint8_t ignored = 0;
    for (unsigned i = 0; i < octets; ++i) {
        source_.readOctet(ignored, status_);
    }
}

void tFieldReader::lowNibble(std::uint8_t& value) {
    std::uint8_t reservedNibble = 0;
    std::uint8_t read = 0;
    source_.readNibble(reservedNibble, status_);
    source_.readNibble(read, status_);
    store(value, read);
}

void tFieldReader::octetArray(std::vector<std::uint8_t>& value, std::uint16_t count) {
    if (status_.failed()) {
        return;
    }
    std::vector<std::uint8_t> read;
    std::uint8_t block[kBlock];
    try {
        for (std::size_t left = count; left > 0 && status_.succeeded();) {
            const std::size_t n = std::min(left, kBlock);
            source_.readOctets(block, n, status_);
            if (status_.succeeded()) {
                read.insert(read.end(), block, block + n);
            }
            left -= n;
        }
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status_, kStatusNoMemory, kComponentCodec);
    }
    if (status_.succeeded()) {
        value.swap(read);
    }
}

void tFieldReader::skip(std::size_t count) {
    std::uint8_t block[kBlock];
    for (std::size_t left = count; left > 0 && status_.succeeded();) {
        const std::size_t n = std::min(left, kBlock);
        source_.readOctets(block, n, status_);
        left -= n;
    }
}

}  // namespace nQVPTP000
