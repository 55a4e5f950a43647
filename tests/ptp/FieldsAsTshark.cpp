#include "tests/ptp/FieldsAsTshark.h"

#include <cstdio>
#include <cstdlib>

#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDomainTLV.h"
#include "ptp/TLVs/tLogAnnounceIntervalTLV.h"
#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/TLVs/tSlaveOnlyTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "ptp/tAnnounceMessage.h"
#include "ptp/tFollowUpMessage.h"
#include "ptp/tManagementMessage.h"
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

// Calls `describe` with the TLV when it is a T.
template <typename T, typename Describe>
bool as(const tTLV& tlv, Describe describe) {
    const auto* typed = dynamic_cast<const T*>(&tlv);
    if (typed != nullptr) {
        describe(*typed);
    }
    return typed != nullptr;
}

void dataField(TsharkFields& f, const tTLV& tlv) {
    const std::string mm = "ptp.v2.mm.";
    // A single-value TLV: its one field.
    auto value = [&f, &mm](const char* name) {
        return [&f, &mm, name](const auto& t) { add(f, mm, name, t.getValue()); };
    };
    as<tUserDescriptionTLV>(
        tlv, [&](const auto& t) { add(f, mm, "userDescription", t.getUserDescription()); }) ||
        as<tCurrentDataSetTLV>(
            tlv,
            [&](const auto& t) {
                add(f, mm, "stepsRemoved", t.getStepsRemoved());
                nanoseconds(f, mm + "offset", t.getOffsetFromMaster().getScaledNanoseconds());
                nanoseconds(f, mm + "pathDelay", t.getMeanPathDelay().getScaledNanoseconds());
            }) ||
        as<tTimeTLV>(
            tlv, [&](const auto& t) { timestamp(f, mm + "currentTime", t.getCurrentTime()); }) ||
        as<tPriority1TLV>(tlv, value("priority1")) || as<tDomainTLV>(tlv, value("domainNumber")) ||
        as<tSlaveOnlyTLV>(tlv, value("SlavOnly")) ||
        as<tLogAnnounceIntervalTLV>(tlv, value("logAnnounceInterval"));
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
    } else if (const auto* u = dynamic_cast<const tFollowUpMessage*>(&message)) {
        timestamp(fields, "ptp.v2.fu.preciseorigintimestamp", u->getPreciseOriginTimestamp());
    }
    return fields;
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
