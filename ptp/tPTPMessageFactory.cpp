#include "ptp/tPTPMessageFactory.h"

#include <new>

#include "ptp/tAnnounceMessage.h"
#include "ptp/tDelayReqMessage.h"
#include "ptp/tDelayRespMessage.h"
#include "ptp/tFollowUpMessage.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tSignalingMessage.h"
#include "ptp/tSyncMessage.h"

namespace nQVPTP000 {

namespace {
constexpr std::uint8_t kVersionPTP = 2;
}  // namespace

std::unique_ptr<tPTPMessage> tPTPMessageFactory::createMessage(iSerializableTarget& source,
                                                               tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    std::unique_ptr<tPTPMessage> message;
    try {
        auto header = std::make_unique<tMessageHeader>(source, status);
        if (status.succeeded() && header->getVersionPTP() != kVersionPTP) {
            QV_STATUS_SET(status, kStatusBadContent, kComponentCodec);
        }
        if (status.succeeded()) {
            message = createBody(std::move(header), source, status);
        }
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    if (status.failed()) {
        return nullptr;
    }
    return message;
}

std::unique_ptr<tPTPMessage> tPTPMessageFactory::createBody(std::unique_ptr<tMessageHeader> header,
                                                            iSerializableTarget& source,
                                                            tStatus& status) {
    switch (header->getMessageType()) {
        case tMessageHeader::kSync:
            return std::make_unique<tSyncMessage>(std::move(header), source, status);
        case tMessageHeader::kDelayReq:
            return std::make_unique<tDelayReqMessage>(std::move(header), source, status);
        case tMessageHeader::kFollowUp:
            return std::make_unique<tFollowUpMessage>(std::move(header), source, status);
        case tMessageHeader::kDelayResp:
            return std::make_unique<tDelayRespMessage>(std::move(header), source, status);
        case tMessageHeader::kAnnounce:
            return std::make_unique<tAnnounceMessage>(std::move(header), source, status);
        case tMessageHeader::kSignaling:
            return std::make_unique<tSignalingMessage>(std::move(header), source, status);
        case tMessageHeader::kManagement:
            return std::make_unique<tManagementMessage>(std::move(header), source, status);
        default:
            QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
            return nullptr;
    }
}

}  // namespace nQVPTP000
