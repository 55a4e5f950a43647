#include "expert/clocks/CPtpAttributeWriter.h"

#include <optional>
#include <vector>

#include "expert/CQVComPtr.h"
#include "expert/clocks/CPtpValueFormat.h"
#include "platform/BStr.h"

namespace {

using nQVPTPMGMT000::iPTPClockProxy;

// A changed value read from the bag in its tag's type (one field is meaningful).
struct tChangedValue {
    BOOL flag = 0;
    LONG signedValue = 0;
    ULONG unsignedValue = 0;
    double real = 0.0;
    std::u16string text;
    kxSysAttrTimestampUTC time{};
};

// Octets of UTF-8, as PTP carries texts.
constexpr std::size_t kMaxUserDescription = 128;

// The description as it goes on the wire; nothing for a text without a faithful form there:
// a lone surrogate (no UTF-8), or a NUL, which would end the text early.
std::optional<std::string> wireText(const std::u16string& text) {
    auto octets = CPtpValueFormat::ptpText(text);
    if (!octets || octets->find('\0') != std::string::npos) {
        return std::nullopt;
    }
    return octets;
}

bool interval(const tChangedValue& v) {
    return v.signedValue >= -127 && v.signedValue <= 127;
}
bool priority(const tChangedValue& v) {
    return v.unsignedValue <= 255;
}
bool always(const tChangedValue&) {
    return true;
}
std::uint8_t low8(ULONG value) {
    return static_cast<std::uint8_t>(value & 0xFF);
}
std::int8_t low8(LONG value) {
    return static_cast<std::int8_t>(static_cast<std::uint8_t>(value & 0xFF));
}

struct tSettableRule {
    kxQvAttributeTag tag;
    const char16_t* message;
    bool (*valid)(const tChangedValue&);
    void (*apply)(iPTPClockProxy&, const tChangedValue&, tStatus&);
};

// The checks, sentences and requests of the settable tags; their types, and which tags are
// settable at all, are kxQvAttributes' (checked below).
constexpr tSettableRule kRules[] = {
    {kxQvUserDescription, u"User Description must be a string <= 128 chars.  ",
     [](const tChangedValue& v) {
         const auto octets = wireText(v.text);
         return octets && octets->size() <= kMaxUserDescription;
     },
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setUserDescription(wireText(v.text).value_or("").c_str(), s);
     }},
    {kxQvDomainNumber, u"Domain must be an integer within the range 0 (PTP default domain) to 3.  ",
     [](const tChangedValue& v) { return v.unsignedValue <= 3; },
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setDomain(low8(v.unsignedValue), s);
     }},
    {kxQvPriority1, u"Priority values must be integers within the range 0-255.  ", priority,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setPriority1(low8(v.unsignedValue), s);
     }},
    {kxQvPriority2, u"Priority values must be integers within the range 0-255.  ", priority,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setPriority2(low8(v.unsignedValue), s);
     }},
    {kxQvSlaveOnly, u"Slave Only must be a boolean.  ", always,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) { p.setSlaveOnly(v.flag != 0, s); }},
    {kxQvAnnounceReceiptTimeout,
     u"Announce Receipt Timeout must be an integer within the range 2-255.  ",
     [](const tChangedValue& v) {
         return v.real >= 2.0 && v.real <= 255.0 &&
                v.real == static_cast<double>(static_cast<int>(v.real));
     },
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setAnnounceReceiptTimeout(static_cast<std::uint8_t>(v.real), s);
     }},
    {kxQvLogAnnounceInterval, u"Announce Interval must be an integer within the range -127-127.  ",
     interval,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setLogAnnounceInterval(low8(v.signedValue), s);
     }},
    {kxQvLogSyncInterval, u"Sync Interval must be an integer within the range -127-127.  ",
     interval,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setLogSyncInterval(low8(v.signedValue), s);
     }},
    {kxQvLogMinPdelayReqInterval,
     u"MinPDelReqIntvl values must be integers within the range -127-127.  ", interval,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setLogMinPdelayReqInterval(low8(v.signedValue), s);
     }},
    {kxQvTime, u"Time values must have a year >= 1970.  ",
     [](const tChangedValue& v) { return CPtpValueFormat::ptpTimeOf(v.time).has_value(); },
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         p.setTime(*CPtpValueFormat::ptpTimeOf(v.time), s);
     }},
    {kxQvPortEnabled, u"ClkSyncEnabled must be a boolean.  ", always,
     [](iPTPClockProxy& p, const tChangedValue& v, tStatus& s) {
         if (v.flag != 0) {
             p.enablePort(s);
         } else {
             p.disablePort(s);
         }
     }},
};

// One rule for each tag that the attribute table marks settable, and for no other.
constexpr bool rulesMatchTable() {
    std::size_t settable = 0;
    for (const kxQvAttribute& row : kxQvAttributes) {
        bool ruled = false;
        for (const tSettableRule& rule : kRules) {
            ruled = ruled || rule.tag == row.tag;
        }
        if (ruled != row.settable) {
            return false;
        }
        settable += row.settable ? 1 : 0;
    }
    return settable == std::size(kRules);
}
static_assert(rulesMatchTable(), "every settable tag of kxQvAttributes has one rule");

const tSettableRule* ruleOf(kxSysAttributeTagID tag) {
    for (const tSettableRule& rule : kRules) {
        if (rule.tag == tag) {
            return &rule;
        }
    }
    return nullptr;
}

// The tag's value in the type of its row; nothing when the bag holds none of that type.
std::optional<tChangedValue> readChanged(IkxSysPropertyBag& bag, kxSysAttributeTagID tag) {
    const kxQvAttribute* row = kxQvFindAttribute(tag);
    if (row == nullptr) {
        return std::nullopt;
    }
    tChangedValue value;
    HRESULT result = E_FAIL;
    switch (row->type) {
        case kxSysPropertyTypeBool:
            result = bag.GetBool(tag, &value.flag);
            break;
        case kxSysPropertyTypeLong:
            result = bag.GetLong(tag, &value.signedValue);
            break;
        case kxSysPropertyTypeULong:
            result = bag.GetULong(tag, &value.unsignedValue);
            break;
        case kxSysPropertyTypeDouble:
            result = bag.GetDouble(tag, &value.real);
            break;
        case kxSysPropertyTypeString: {
            BSTR text = nullptr;
            result = bag.GetString(tag, &text);
            if (SUCCEEDED(result) && text != nullptr) {
                value.text = qv::dsc::OleText::toLibrary(text, qv::dsc::BStr::length(text));
            }
            qv::dsc::BStr::release(text);
            break;
        }
        case kxSysPropertyTypeTimestamp: {
            CQVComPtr<IkxSysPropertyBag2> second;
            result = bag.QueryInterface(IID_IkxSysPropertyBag2,
                                        reinterpret_cast<void**>(second.Receive()));
            if (SUCCEEDED(result)) {
                result = second->GetTimestamp(tag, &value.time);
            }
            break;
        }
        default:
            break;
    }
    return SUCCEEDED(result) ? std::optional<tChangedValue>(value) : std::nullopt;
}

// The changed tags in the bag's order (none when the bag reports none).
std::vector<kxSysAttributeTagID> changedTags(IkxSysPropertyBag& bag) {
    std::vector<kxSysAttributeTagID> tags;
    CQVComPtr<IkxSysPropertyBag2> second;
    if (FAILED(bag.QueryInterface(IID_IkxSysPropertyBag2,
                                  reinterpret_cast<void**>(second.Receive())))) {
        return tags;
    }
    CQVComPtr<IkxSysEnumPropertyTag> changed;
    if (second->EnumerateChangedTags(changed.Receive()) != S_OK || !changed) {
        return tags;
    }
    kxSysAttributeTagID tag = 0;
    ULONG fetched = 0;
    while (changed->Next(1, &tag, &fetched) == S_OK && fetched == 1) {
        tags.push_back(tag);
    }
    return tags;
}

}  // namespace

HRESULT CPtpAttributeWriter::validate(IkxSysPropertyBag& bag, tTagSet& accepted,
                                      std::u16string& message) {
    bool rejected = false;
    for (const kxSysAttributeTagID tag : changedTags(bag)) {
        const tSettableRule* rule = ruleOf(tag);
        if (rule == nullptr) {
            continue;
        }
        const auto value = readChanged(bag, tag);
        if (value && rule->valid(*value)) {
            accepted.insert(tag);
        } else {
            message += rule->message;
            rejected = true;
        }
    }
    if (rejected) {
        return CORBEL_E_INVALID_VALUE;
    }
    return accepted.empty() ? S_FALSE : S_OK;
}

HRESULT CPtpAttributeWriter::apply(IkxSysPropertyBag& bag, const tClockLookup& lookup,
                                   tApplyFailure& failure) {
    iPTPClockProxy* proxy = nullptr;
    for (const kxSysAttributeTagID tag : changedTags(bag)) {
        const tSettableRule* rule = ruleOf(tag);
        if (rule == nullptr) {
            continue;
        }
        failure.tag = tag;
        if (proxy == nullptr && (proxy = lookup()) == nullptr) {
            return E_FAIL;
        }
        // A host may skip validation: a value it would reject is never sent, and nothing after.
        const auto value = readChanged(bag, tag);
        if (!value || !rule->valid(*value)) {
            failure.sentence = rule->message;
            return CORBEL_E_INVALID_VALUE;
        }
        rule->apply(*proxy, *value, failure.status);
        if (failure.status.failed()) {
            return E_FAIL;
        }
    }
    failure.tag = 0;
    return S_OK;
}
