#include "ptp/tOrganizationExtensionTLVFactory.h"

#include <new>

#include "ptp/TLVs/tLXIConsortiumNotDefinedTLV.h"
#include "ptp/codecTrace.h"
#include "ptp/tTLVWindow.h"

namespace nQVPTP000 {

namespace {

// The company identifier under which this system's own organization would extend PTP.
constexpr std::uint32_t kOwnCompanyId = 0x02A53C;
constexpr std::int32_t kTraceCode = 105;

std::uint32_t identifier(const std::uint8_t (&octets)[3]) {
    return std::uint32_t{octets[0]} << 16 | std::uint32_t{octets[1]} << 8 | octets[2];
}

}  // namespace

std::unique_ptr<tOrganizationExtensionTLV>
tOrganizationExtensionTLVFactory::createOrganizationExtensionTLV(iSerializableTarget& source,
                                                                 tStatus& status) {
    std::uint16_t lengthField = 0;
    std::uint8_t organizationId[3] = {};
    std::uint8_t organizationSubType[3] = {};
    source.readUInteger16(lengthField, status);
    tTLVWindow value(source, lengthField);
    value.readOctets(organizationId, 3, status);
    value.readOctets(organizationSubType, 3, status);
    std::unique_ptr<tOrganizationExtensionTLV> tlv;
    if (status.succeeded()) {
        if (identifier(organizationId) == tLXIConsortiumNotDefinedTLV::kLXIConsortium &&
            identifier(organizationSubType) == tLXIConsortiumNotDefinedTLV::kNotDefined) {
            try {
                tlv = std::make_unique<tLXIConsortiumNotDefinedTLV>();
            } catch (const std::bad_alloc&) {
                QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
            }
        } else {
            reportUnsupported(identifier(organizationId), identifier(organizationSubType), status);
        }
    }
    if (tlv) {
        tlv->setDataLength(
            static_cast<std::uint16_t>(lengthField - tOrganizationExtensionTLV::kIdentifiersSize),
            status, 1);
        tlv->deserializeDataField(value, status);
    }
    value.close(status);
    if (status.failed()) {
        return nullptr;
    }
    return tlv;
}

void tOrganizationExtensionTLVFactory::reportUnsupported(std::uint32_t organizationId,
                                                         std::uint32_t organizationSubType,
                                                         tStatus& status) {
    nQVTARN000::tTrace& trace = codecTrace();
    trace.beginLine(kComponentCodec, __LINE__, __FILE__, kTraceCode, 0);
    if (organizationId == tLXIConsortiumNotDefinedTLV::kLXIConsortium) {
        trace.appendFormatted(
            "Unsupported organizationSubType %.6x for                            "
            "organization %.6x\n",
            organizationSubType, organizationId);
    } else if (organizationId == kOwnCompanyId) {
        trace.appendFormatted(
            "Unsupported organizationSubType %.6x for                      organization %.6x\n",
            organizationSubType, organizationId);
    } else {
        trace.appendFormatted("Unsupported organizationId %.6x\n", organizationId);
    }
    trace.endLine();
    QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
}

}  // namespace nQVPTP000
