#include "tests/ptp/FieldsAsTshark.h"

#include <cstdio>
#include <cstdlib>
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

// A value in the form tshark shows it.
struct Shown {
    template <typename T>
    requires std::is_integral_v<T> Shown(T number) : text(std::to_string(number)) {}
    Shown(const tClockIdentity& identity) {
        text = hexText(identity.getOctets(), tClockIdentity::kSize);
        std::erase(text, ' ');
        text.insert(0, "0x");
    }
    Shown(const tPTPText& value) : text(value.view()) {}
    // Octet strings: "02:00:00:00:00:01".
    template <std::size_t N>
    Shown(std::span<const std::uint8_t, N> octets) : text(hexText(octets.data(), octets.size())) {
        for (char& c : text) {
            c = c == ' ' ? ':' : static_cast<char>(std::tolower(c));
        }
    }
    Shown(std::string shown) : text(std::move(shown)) {}
    std::string text;
};

// Adds fields given as name, value, name, value...
void add(TsharkFields& /*fields*/, const std::string& /*prefix*/) {}
template <typename Value, typename... Rest>
void add(TsharkFields& fields, const std::string& prefix, const char* name, const Value& value,
         const Rest&... rest) {
    fields.emplace_back(prefix + name, Shown(value).text);
    add(fields, prefix, rest...);
}

void timestamp(TsharkFields& fields, const std::string& prefix, const tTimestamp& value) {
    add(fields, prefix, ".seconds", value.getSeconds(), ".nanoseconds", value.getNanoseconds());
}

// Scaled nanoseconds as tshark splits them: whole nanoseconds, and the fraction in decimal.
void nanoseconds(TsharkFields& fields, const std::string& prefix, std::int64_t scaled) {
    char fraction[32];
    std::snprintf(fraction, sizeof fraction, "%.17g", static_cast<double>(scaled & 0xFFFF) / 65536);
    add(fields, prefix, ".ns", scaled >> 16, ".subns", fraction);
}

void header(TsharkFields& fields, const tMessageHeader& h) {
    using F = tMessageHeader::tFlag;
    add(fields, "ptp.v2.", "majorsdoid", h.getTransportSpecific(), "messagetype",
        h.getMessageType(), "versionptp", h.getVersionPTP(), "messagelength", h.getMessageLength(),
        "domainnumber", h.getDomainNumber(), "clockidentity",
        h.getSourcePortIdentity().getClockIdentity(), "sourceportid",
        h.getSourcePortIdentity().getPortNumber(), "sequenceid", h.getSequenceId(), "controlfield",
        h.getControlField(), "logmessageperiod", h.getLogMessageInterval());
    add(fields, "ptp.v2.flags.", "security", h.getFlag(F::secure), "specific2",
        h.getFlag(F::profileSpecific2), "specific1", h.getFlag(F::profileSpecific1), "unicast",
        h.getFlag(F::unicast), "twostep", h.getFlag(F::twoStep), "alternatemaster",
        h.getFlag(F::alternateMaster), "frequencytraceable", h.getFlag(F::frequencyTraceable),
        "timetraceable", h.getFlag(F::timeTraceable), "timescale", h.getFlag(F::ptpTimescale),
        "utcreasonable", h.getFlag(F::currentUtcOffsetValid), "li59", h.getFlag(F::leap59), "li61",
        h.getFlag(F::leap61));
    nanoseconds(fields, "ptp.v2.correction", h.getCorrectionField());
}

void announce(TsharkFields& fields, const tAnnounceMessage& a) {
    const tClockQuality& quality = a.getGrandmasterClockQuality();
    timestamp(fields, "ptp.v2.an.origintimestamp", a.getOriginTimestamp());
    add(fields, "ptp.v2.an.", "origincurrentutcoffset", a.getCurrentUtcOffset(), "priority1",
        a.getGrandmasterPriority1(), "grandmasterclockclass", quality.clockClass,
        "grandmasterclockaccuracy", quality.clockAccuracy, "grandmasterclockvariance",
        quality.offsetScaledLogVariance, "priority2", a.getGrandmasterPriority2(),
        "grandmasterclockidentity", a.getGrandmasterIdentity(), "localstepsremoved",
        a.getStepsRemoved());
    add(fields, "ptp.v2.", "timesource", a.getTimeSource());
}

void quality(TsharkFields& fields, const std::string& prefix, const tClockQuality& q) {
    add(fields, "ptp.v2.mm." + prefix, "clockclass", q.clockClass, "clockaccuracy", q.clockAccuracy,
        "clockvariance", q.offsetScaledLogVariance);
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
    add(f, "ptp.v2.mm.", "clockType.OC", t.getOrdinaryClock(), "clockType.BC", t.getBoundaryClock(),
        "clockType.p2p_TC", t.getP2PTransparentClock(), "clockType.e2e_TC",
        t.getE2ETransparentClock(), "clockType.MM", t.getManagementNode(), "physicalLayerProtocol",
        t.getPhysicalLayerProtocol(), "physicalAddressLength", t.getPhysicalAddressLength(),
        "physicalAddress", t.getPhysicalAddress(), "networkProtocol", address.getNetworkProtocol(),
        "protocolAddress", std::span(address.getAddressField(), address.getAddressLength()),
        "manufacturerIdentity", t.getManufacturerIdentity(), "productDescription",
        t.getProductDescription(), "revisionData", t.getRevisionData(), "userDescription",
        t.getUserDescription(), "profileIdentity", t.getProfileIdentity());
}

void faultLog(TsharkFields& f, const tFaultLogTLV& t) {
    add(f, "ptp.v2.mm.", "numberOfFaultRecords", t.getNumberOfFaultRecords());
    for (const tFaultRecord& record : t.getFaultRecords()) {
        add(f, "ptp.v2.mm.", "faultRecordLength", record.getFaultRecordLength());
        timestamp(f, "ptp.v2.mm.faultTime", record.getFaultTime());
        add(f, "ptp.v2.mm.", "severityCode", record.getSeverityCode(), "faultName",
            record.getFaultName(), "faultValue", record.getFaultValue(), "faultDescription",
            record.getFaultDescription());
    }
}

void defaultDataSet(TsharkFields& f, const tDefaultDataSetTLV& t) {
    quality(f, "", t.getClockQuality());
    add(f, "ptp.v2.mm.", "twoStep", t.getTwoStepFlag(), "SlavOnly", t.getSlaveOnly(), "numberPorts",
        t.getNumberPorts(), "priority1", t.getPriority1(), "priority2", t.getPriority2(),
        "clockidentity", t.getClockIdentity(), "domainNumber", t.getDomainNumber());
}

void parentDataSet(TsharkFields& f, const tParentDataSetTLV& t) {
    quality(f, "grandmaster", t.getGrandmasterClockQuality());
    add(f, "ptp.v2.mm.", "parentclockidentity", t.getParentPortIdentity().getClockIdentity(),
        "parentsourceportid", t.getParentPortIdentity().getPortNumber(), "parentstats",
        t.getParentStats(), "observedParentOffsetScaledLogVariance",
        t.getObservedParentOffsetScaledLogVariance(), "observedParentClockPhaseChangeRate",
        t.getObservedParentClockPhaseChangeRate(), "grandmasterPriority1",
        t.getGrandmasterPriority1(), "grandmasterPriority2", t.getGrandmasterPriority2(),
        "grandmasterclockidentity", t.getGrandmasterIdentity());
}

void portDataSet(TsharkFields& f, const tPortDataSetTLV& t) {
    nanoseconds(f, "ptp.v2.mm.peerMeanPathDelay", t.getPeerMeanPathDelay().getScaledNanoseconds());
    add(f, "ptp.v2.mm.", "clockidentity", t.getPortIdentity().getClockIdentity(), "PortNumber",
        t.getPortIdentity().getPortNumber(), "portState", t.getPortState(),
        "logMinDelayReqInterval", t.getLogMinDelayReqInterval(), "logAnnounceInterval",
        t.getLogAnnounceInterval(), "announceReceiptTimeout", t.getAnnounceReceiptTimeout(),
        "logSyncInterval", t.getLogSyncInterval(), "delayMechanism", t.getDelayMechanism(),
        "logMinPdelayReqInterval", t.getLogMinPdelayReqInterval(), "versionNumber",
        t.getVersionNumber());
}

// UTC_PROPERTIES, TIME_PROPERTIES_DATA_SET and the two properties TLVs share field names.
template <typename T>
void utc(TsharkFields& f, const T& t) {
    add(f, "ptp.v2.mm.", "currentutcoffset", t.getCurrentUtcOffset(), "li61", t.getLeap61(), "li59",
        t.getLeap59(), "CurrentUTCOffsetValid", t.getCurrentUtcOffsetValid());
}
template <typename T>
void traceability(TsharkFields& f, const T& t) {
    add(f, "ptp.v2.mm.", "timeTraceable", t.getTimeTraceable(), "frequencyTraceable",
        t.getFrequencyTraceable());
}
template <typename T>
void timescale(TsharkFields& f, const T& t) {
    add(f, "ptp.v2.mm.", "ptptimescale", t.getPtpTimescale(), "timesource", t.getTimeSource());
}

void dataField(TsharkFields& f, const tTLV& tlv) {
    const std::string mm = "ptp.v2.mm.";
    // A single-value TLV: its one field.
    auto value = [&f, &mm](const char* name) {
        return [&f, &mm, name](const auto& t) { add(f, mm, name, t.getValue()); };
    };
    as<tClockDescriptionTLV>(tlv, [&](const auto& t) { clockDescription(f, t); }) ||
        as<tUserDescriptionTLV>(
            tlv, [&](const auto& t) { add(f, mm, "userDescription", t.getUserDescription()); }) ||
        as<tInitializeTLV>(
            tlv,
            [&](const auto& t) { add(f, mm, "initializationKey", t.getInitializationKey()); }) ||
        as<tFaultLogTLV>(tlv, [&](const auto& t) { faultLog(f, t); }) ||
        as<tDefaultDataSetTLV>(tlv, [&](const auto& t) { defaultDataSet(f, t); }) ||
        as<tCurrentDataSetTLV>(
            tlv,
            [&](const auto& t) {
                add(f, mm, "stepsRemoved", t.getStepsRemoved());
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
    add(f, "ptp.v2.mm.", "targetportidentity", m.getTargetPortIdentity().getClockIdentity(),
        "targetportid", m.getTargetPortIdentity().getPortNumber(), "startingboundaryhops",
        m.getStartingBoundaryHops(), "boundaryhops", m.getBoundaryHops(), "action",
        m.getActionField());
    tStatus status;
    for (std::size_t i = 0; i < m.getSuffix()->getCount(); ++i) {
        const tTLV* tlv = m.getSuffix()->getTLV(i, status);
        add(f, "ptp.v2.mm.", "tlvType", tlv->getTlvType(), "lengthField", tlv->getLengthField());
        if (const auto* payload = dynamic_cast<const tManagementMessagePayload*>(tlv)) {
            add(f, "ptp.v2.mm.", "managementId", payload->getManagementId());
        }
        if (const auto* error = dynamic_cast<const tManagementErrorStatusTLV*>(tlv)) {
            add(f, "ptp.v2.mm.", "managementErrorId", error->getManagementErrorId());
            if (error->getDisplayData().getLengthField() != 0) {
                add(f, "ptp.v2.mm.", "displayData", error->getDisplayData());
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
        add(fields, "ptp.v2.dr.", "requestingsourceportidentity", requesting.getClockIdentity(),
            "requestingsourceportid", requesting.getPortNumber());
    } else if (const auto* g = dynamic_cast<const tSignalingMessage*>(&message)) {
        add(fields, "ptp.v2.sig.", "targetportidentity",
            g->getTargetPortIdentity().getClockIdentity(), "targetportid",
            g->getTargetPortIdentity().getPortNumber());
    }
    return fields;
}

bool notModelled(const std::string& field) {
    static const std::string kNames =
        " ptp.v2.minorversionptp ptp.v2.minorsdoid ptp.v2.messagetypespecific ptp.v2.flags"
        " ptp.v2.clockidentity_manuf ptp.v2.flags.synchronizationUncertain ptp.v2.mm.data"
        " ptp.v2.fu.preciseorigintimestamp.32bit ptp.v2.mm.reserved ptp.v2.mm.pad"
        " ptp.v2.mm.clockType ptp.v2.mm.clockType.reserved ";
    // A text's length octet: the text shows it.
    return kNames.find(" " + field + " ") != std::string::npos || field.ends_with(".length");
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
