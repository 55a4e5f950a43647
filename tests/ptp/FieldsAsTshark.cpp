#include "tests/ptp/FieldsAsTshark.h"

#include <cstdio>
#include <cstdlib>
#include <initializer_list>
#include <span>

#include "ptp/TLVs/tAnnounceReceiptTimeoutTLV.h"
#include "ptp/TLVs/tClockAccuracyTLV.h"
#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tDelayMechanismTLV.h"
#include "ptp/TLVs/tDomainTLV.h"
#include "ptp/TLVs/tFaultLogTLV.h"
#include "ptp/TLVs/tInitializeTLV.h"
#include "ptp/TLVs/tLogAnnounceIntervalTLV.h"
#include "ptp/TLVs/tLogMinPdelayReqIntervalTLV.h"
#include "ptp/TLVs/tLogSyncIntervalTLV.h"
#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/TLVs/tPriority2TLV.h"
#include "ptp/TLVs/tSlaveOnlyTLV.h"
#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tTimescalePropertiesTLV.h"
#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "ptp/TLVs/tVersionNumberTLV.h"
#include "ptp/tAnnounceMessage.h"
#include "ptp/tDelayReqMessage.h"
#include "ptp/tDelayRespMessage.h"
#include "ptp/tFollowUpMessage.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tSignalingMessage.h"
#include "ptp/tSyncMessage.h"
#include "tests/support/Hex.h"

using namespace nQVPTP000;

namespace qvtest {

namespace {

using Pairs = std::initializer_list<std::pair<const char*, std::string>>;

template <typename T>
requires std::is_integral_v<T> std::string text(T value) {
    return std::to_string(value);
}
std::string text(const tClockIdentity& identity) {
    std::string digits = hexText(identity.getOctets(), tClockIdentity::kSize);
    std::erase(digits, ' ');
    return "0x" + digits;
}
std::string text(const tPTPText& value) {
    return std::string(value.view());
}
// Octet strings as tshark shows them: "02:00:00:00:00:01".
std::string text(std::span<const std::uint8_t> octets) {
    std::string shown = hexText(octets.data(), octets.size());
    for (char& c : shown) {
        c = c == ' ' ? ':' : static_cast<char>(std::tolower(c));
    }
    return shown;
}

void add(TsharkFields& fields, const std::string& prefix, Pairs pairs) {
    for (const auto& [name, value] : pairs) {
        fields.emplace_back(prefix + name, value);
    }
}

void timestamp(TsharkFields& fields, const std::string& prefix, const tTimestamp& value) {
    add(fields, prefix,
        {{".seconds", text(value.getSeconds())}, {".nanoseconds", text(value.getNanoseconds())}});
}

// Scaled nanoseconds as tshark splits them: whole nanoseconds, and the fraction in decimal.
void nanoseconds(TsharkFields& fields, const std::string& prefix, std::int64_t scaled) {
    char fraction[32];
    std::snprintf(fraction, sizeof fraction, "%.17g", static_cast<double>(scaled & 0xFFFF) / 65536);
    add(fields, prefix, {{".ns", text(scaled >> 16)}, {".subns", fraction}});
}

void header(TsharkFields& fields, const tMessageHeader& h) {
    using F = tMessageHeader::tFlag;
    add(fields, "ptp.v2.",
        {{"majorsdoid", text(h.getTransportSpecific())},
         {"messagetype", text(h.getMessageType())},
         {"versionptp", text(h.getVersionPTP())},
         {"messagelength", text(h.getMessageLength())},
         {"domainnumber", text(h.getDomainNumber())},

         {"clockidentity", text(h.getSourcePortIdentity().getClockIdentity())},
         {"sourceportid", text(h.getSourcePortIdentity().getPortNumber())},
         {"sequenceid", text(h.getSequenceId())},
         {"controlfield", text(h.getControlField())},
         {"logmessageperiod", text(h.getLogMessageInterval())}});
    const std::pair<F, const char*> flags[] = {{F::secure, "security"},
                                               {F::profileSpecific2, "specific2"},
                                               {F::profileSpecific1, "specific1"},
                                               {F::unicast, "unicast"},
                                               {F::twoStep, "twostep"},
                                               {F::alternateMaster, "alternatemaster"},
                                               {F::frequencyTraceable, "frequencytraceable"},
                                               {F::timeTraceable, "timetraceable"},
                                               {F::ptpTimescale, "timescale"},
                                               {F::currentUtcOffsetValid, "utcreasonable"},
                                               {F::leap59, "li59"},
                                               {F::leap61, "li61"}};
    nanoseconds(fields, "ptp.v2.correction", h.getCorrectionField());
    for (const auto& [flag, name] : flags) {
        add(fields, "ptp.v2.flags.", {{name, text(h.getFlag(flag))}});
    }
}

void announce(TsharkFields& fields, const tAnnounceMessage& a) {
    const tClockQuality& quality = a.getGrandmasterClockQuality();
    timestamp(fields, "ptp.v2.an.origintimestamp", a.getOriginTimestamp());
    add(fields, "ptp.v2.an.",
        {{"origincurrentutcoffset", text(a.getCurrentUtcOffset())},
         {"priority1", text(a.getGrandmasterPriority1())},
         {"grandmasterclockclass", text(quality.clockClass)},
         {"grandmasterclockaccuracy", text(quality.clockAccuracy)},
         {"grandmasterclockvariance", text(quality.offsetScaledLogVariance)},
         {"priority2", text(a.getGrandmasterPriority2())},
         {"grandmasterclockidentity", text(a.getGrandmasterIdentity())},
         {"localstepsremoved", text(a.getStepsRemoved())}});
    add(fields, "ptp.v2.", {{"timesource", text(a.getTimeSource())}});
}

void quality(TsharkFields& fields, const std::string& prefix, const tClockQuality& q) {
    add(fields, "ptp.v2.mm." + prefix,
        {{"clockclass", text(q.clockClass)},
         {"clockaccuracy", text(q.clockAccuracy)},
         {"clockvariance", text(q.offsetScaledLogVariance)}});
}

// Calls `describe` with the TLV when it is a T.
template <typename T, typename Describe>
bool as(const tTLV& tlv, Describe describe) {
    const auto* typed = dynamic_cast<const T*>(&tlv);
    if (typed != nullptr) {
        describe(*typed);
    }
    return typed != nullptr;
}

void clockDescription(TsharkFields& f, const tClockDescriptionTLV& t) {
    const tPortAddress address = t.getProtocolAddress();
    add(f, "ptp.v2.mm.",
        {{"clockType.OC", text(t.getOrdinaryClock())},
         {"clockType.BC", text(t.getBoundaryClock())},
         {"clockType.p2p_TC", text(t.getP2pTransparentClock())},
         {"clockType.e2e_TC", text(t.getE2eTransparentClock())},
         {"clockType.MM", text(t.getManagementNode())},
         {"physicalLayerProtocol", text(t.getPhysicalLayerProtocol())},
         {"physicalAddressLength", text(t.getPhysicalAddressLength())},
         {"physicalAddress", text(t.getPhysicalAddress())},
         {"networkProtocol", text(address.getNetworkProtocol())},
         {"protocolAddress",
          text(std::span(address.getAddressField(), address.getAddressLength()))},
         {"manufacturerIdentity", text(t.getManufacturerIdentity())},
         {"productDescription", text(t.getProductDescription())},
         {"revisionData", text(t.getRevisionData())},
         {"userDescription", text(t.getUserDescription())},
         {"profileIdentity", text(t.getProfileIdentity())}});
}

void faultLog(TsharkFields& f, const tFaultLogTLV& t) {
    add(f, "ptp.v2.mm.", {{"numberOfFaultRecords", text(t.getNumberOfFaultRecords())}});
    for (const tFaultRecord& record : t.getFaultRecords()) {
        add(f, "ptp.v2.mm.", {{"faultRecordLength", text(record.getFaultRecordLength())}});
        timestamp(f, "ptp.v2.mm.faultTime", record.getFaultTime());
        add(f, "ptp.v2.mm.",
            {{"severityCode", text(record.getSeverityCode())},
             {"faultName", text(record.getFaultName())},
             {"faultValue", text(record.getFaultValue())},
             {"faultDescription", text(record.getFaultDescription())}});
    }
}

void defaultDataSet(TsharkFields& f, const tDefaultDataSetTLV& t) {
    quality(f, "", t.getClockQuality());
    add(f, "ptp.v2.mm.",
        {{"twoStep", text(t.getTwoStepFlag())},
         {"SlavOnly", text(t.getSlaveOnly())},
         {"numberPorts", text(t.getNumberPorts())},
         {"priority1", text(t.getPriority1())},
         {"priority2", text(t.getPriority2())},
         {"clockidentity", text(t.getClockIdentity())},
         {"domainNumber", text(t.getDomainNumber())}});
}

void parentDataSet(TsharkFields& f, const tParentDataSetTLV& t) {
    quality(f, "grandmaster", t.getGrandmasterClockQuality());
    add(f, "ptp.v2.mm.",
        {{"parentclockidentity", text(t.getParentPortIdentity().getClockIdentity())},
         {"parentsourceportid", text(t.getParentPortIdentity().getPortNumber())},
         {"parentstats", text(t.getParentStats())},
         {"observedParentOffsetScaledLogVariance",
          text(t.getObservedParentOffsetScaledLogVariance())},
         {"observedParentClockPhaseChangeRate", text(t.getObservedParentClockPhaseChangeRate())},
         {"grandmasterPriority1", text(t.getGrandmasterPriority1())},
         {"grandmasterPriority2", text(t.getGrandmasterPriority2())},
         {"grandmasterclockidentity", text(t.getGrandmasterIdentity())}});
}

void portDataSet(TsharkFields& f, const tPortDataSetTLV& t) {
    nanoseconds(f, "ptp.v2.mm.peerMeanPathDelay", t.getPeerMeanPathDelay().getScaledNanoseconds());
    add(f, "ptp.v2.mm.",
        {{"clockidentity", text(t.getPortIdentity().getClockIdentity())},
         {"PortNumber", text(t.getPortIdentity().getPortNumber())},
         {"portState", text(t.getPortState())},
         {"logMinDelayReqInterval", text(t.getLogMinDelayReqInterval())},
         {"logAnnounceInterval", text(t.getLogAnnounceInterval())},
         {"announceReceiptTimeout", text(t.getAnnounceReceiptTimeout())},
         {"logSyncInterval", text(t.getLogSyncInterval())},
         {"delayMechanism", text(t.getDelayMechanism())},
         {"logMinPdelayReqInterval", text(t.getLogMinPdelayReqInterval())},
         {"versionNumber", text(t.getVersionNumber())}});
}

// UTC_PROPERTIES, TIME_PROPERTIES_DATA_SET and the two properties TLVs share field names.
template <typename T>
void utc(TsharkFields& f, const T& t) {
    add(f, "ptp.v2.mm.",
        {{"currentutcoffset", text(t.getCurrentUtcOffset())},
         {"li61", text(t.getLeap61())},
         {"li59", text(t.getLeap59())},
         {"CurrentUTCOffsetValid", text(t.getCurrentUtcOffsetValid())}});
}
template <typename T>
void traceability(TsharkFields& f, const T& t) {
    add(f, "ptp.v2.mm.",
        {{"timeTraceable", text(t.getTimeTraceable())},
         {"frequencyTraceable", text(t.getFrequencyTraceable())}});
}
template <typename T>
void timescale(TsharkFields& f, const T& t) {
    add(f, "ptp.v2.mm.",
        {{"ptptimescale", text(t.getPtpTimescale())}, {"timesource", text(t.getTimeSource())}});
}

void dataField(TsharkFields& f, const tTLV& tlv) {
    const std::string mm = "ptp.v2.mm.";
    // A single-value TLV: its one field.
    auto value = [&f, &mm](const char* name) {
        return [&f, &mm, name](const auto& t) { add(f, mm, {{name, text(t.getValue())}}); };
    };
    as<tClockDescriptionTLV>(tlv, [&](const auto& t) { clockDescription(f, t); }) ||
        as<tUserDescriptionTLV>(tlv,
                                [&](const auto& t) {
                                    add(f, mm, {{"userDescription", text(t.getUserDescription())}});
                                }) ||
        as<tInitializeTLV>(tlv,
                           [&](const auto& t) {
                               add(f, mm, {{"initializationKey", text(t.getInitializationKey())}});
                           }) ||
        as<tFaultLogTLV>(tlv, [&](const auto& t) { faultLog(f, t); }) ||
        as<tDefaultDataSetTLV>(tlv, [&](const auto& t) { defaultDataSet(f, t); }) ||
        as<tCurrentDataSetTLV>(
            tlv,
            [&](const auto& t) {
                add(f, mm, {{"stepsRemoved", text(t.getStepsRemoved())}});
                nanoseconds(f, mm + "offset", t.getOffsetFromMaster().getScaledNanoseconds());
                nanoseconds(f, mm + "pathDelay", t.getMeanPathDelay().getScaledNanoseconds());
            }) ||
        as<tParentDataSetTLV>(tlv, [&](const auto& t) { parentDataSet(f, t); }) ||
        as<tTimePropertiesDataSetTLV>(tlv,
                                      [&](const auto& t) {
                                          utc(f, t);
                                          traceability(f, t);
                                          timescale(f, t);
                                      }) ||
        as<tPortDataSetTLV>(tlv, [&](const auto& t) { portDataSet(f, t); }) ||
        as<tTimeTLV>(
            tlv, [&](const auto& t) { timestamp(f, mm + "currentTime", t.getCurrentTime()); }) ||
        as<tUTCPropertiesTLV>(tlv, [&](const auto& t) { utc(f, t); }) ||
        as<tTraceabilityPropertiesTLV>(tlv, [&](const auto& t) { traceability(f, t); }) ||
        as<tTimescalePropertiesTLV>(tlv, [&](const auto& t) { timescale(f, t); }) ||
        as<tPriority1TLV>(tlv, value("priority1")) || as<tPriority2TLV>(tlv, value("priority2")) ||
        as<tDomainTLV>(tlv, value("domainNumber")) || as<tSlaveOnlyTLV>(tlv, value("SlavOnly")) ||
        as<tLogAnnounceIntervalTLV>(tlv, value("logAnnounceInterval")) ||
        as<tAnnounceReceiptTimeoutTLV>(tlv, value("announceReceiptTimeout")) ||
        as<tLogSyncIntervalTLV>(tlv, value("logSyncInterval")) ||
        as<tVersionNumberTLV>(tlv, value("versionNumber")) ||
        as<tClockAccuracyTLV>(tlv, value("clockaccuracy")) ||
        as<tDelayMechanismTLV>(tlv, value("delayMechanism")) ||
        as<tLogMinPdelayReqIntervalTLV>(tlv, value("logMinPdelayReqInterval"));
}

void management(TsharkFields& f, const tManagementMessage& m) {
    add(f, "ptp.v2.mm.",
        {{"targetportidentity", text(m.getTargetPortIdentity().getClockIdentity())},
         {"targetportid", text(m.getTargetPortIdentity().getPortNumber())},
         {"startingboundaryhops", text(m.getStartingBoundaryHops())},
         {"boundaryhops", text(m.getBoundaryHops())},
         {"action", text(m.getActionField())}});
    tStatus status;
    for (std::size_t i = 0; i < m.getSuffix()->getCount(); ++i) {
        const tTLV* tlv = m.getSuffix()->getTLV(i, status);
        add(f, "ptp.v2.mm.",
            {{"tlvType", text(tlv->getTlvType())}, {"lengthField", text(tlv->getLengthField())}});
        if (const auto* payload = dynamic_cast<const tManagementMessagePayload*>(tlv)) {
            add(f, "ptp.v2.mm.", {{"managementId", text(payload->getManagementId())}});
        }
        if (const auto* error = dynamic_cast<const tManagementErrorStatusTLV*>(tlv)) {
            add(f, "ptp.v2.mm.", {{"managementErrorId", text(error->getManagementErrorId())}});
            if (error->getDisplayData().getLengthField() != 0) {
                add(f, "ptp.v2.mm.", {{"displayData", text(error->getDisplayData())}});
            }
        }
        dataField(f, *tlv);
    }
}

}  // namespace

TsharkFields fieldsAsTshark(const tPTPMessage& message) {
    TsharkFields fields;
    header(fields, *message.getHeader());
    if (const auto* m = dynamic_cast<const tManagementMessage*>(&message)) {
        management(fields, *m);
    } else if (const auto* a = dynamic_cast<const tAnnounceMessage*>(&message)) {
        announce(fields, *a);
    } else if (const auto* s = dynamic_cast<const tSyncMessage*>(&message)) {
        timestamp(fields, "ptp.v2.sdr.origintimestamp", s->getOriginTimestamp());
    } else if (const auto* d = dynamic_cast<const tDelayReqMessage*>(&message)) {
        timestamp(fields, "ptp.v2.sdr.origintimestamp", d->getOriginTimestamp());
    } else if (const auto* u = dynamic_cast<const tFollowUpMessage*>(&message)) {
        timestamp(fields, "ptp.v2.fu.preciseorigintimestamp", u->getPreciseOriginTimestamp());
    } else if (const auto* r = dynamic_cast<const tDelayRespMessage*>(&message)) {
        timestamp(fields, "ptp.v2.dr.receivetimestamp", r->getReceiveTimestamp());
        const tPortIdentity& requesting = r->getRequestingPortIdentity();
        add(fields, "ptp.v2.dr.",
            {{"requestingsourceportidentity", text(requesting.getClockIdentity())},
             {"requestingsourceportid", text(requesting.getPortNumber())}});
    } else if (const auto* g = dynamic_cast<const tSignalingMessage*>(&message)) {
        add(fields, "ptp.v2.sig.",
            {{"targetportidentity", text(g->getTargetPortIdentity().getClockIdentity())},
             {"targetportid", text(g->getTargetPortIdentity().getPortNumber())}});
    }
    return fields;
}

bool notModelled(const std::string& field) {
    static const char* const kNames[] = {"ptp.v2.minorversionptp",
                                         "ptp.v2.minorsdoid",
                                         "ptp.v2.messagetypespecific",
                                         "ptp.v2.clockidentity_manuf",
                                         "ptp.v2.flags",
                                         "ptp.v2.flags.synchronizationUncertain",
                                         "ptp.v2.fu.preciseorigintimestamp.32bit",
                                         "ptp.v2.mm.data",
                                         "ptp.v2.mm.reserved",
                                         "ptp.v2.mm.pad",
                                         "ptp.v2.mm.clockType",
                                         "ptp.v2.mm.clockType.reserved"};
    for (const char* name : kNames) {
        if (field == name) {
            return true;
        }
    }
    return field.ends_with(".length");  // a text's length octet: the text shows it
}

std::string comparable(const std::string& shown) {
    char* end = nullptr;
    const unsigned long long number = std::strtoull(shown.c_str(), &end, 0);
    if (shown.empty() || *end != '\0' || shown.find(':') != std::string::npos) {
        return shown;
    }
    return std::to_string(number);
}

}  // namespace qvtest
