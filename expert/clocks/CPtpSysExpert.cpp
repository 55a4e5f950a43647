#include "expert/clocks/CPtpSysExpert.h"

#include <unistd.h>

#include <cstdio>
#include <string>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "expert/CkxDynamicPropertyBag.h"
#include "expert/CkxSysEnumItemNamesSTL.h"
#include "expert/CkxSysEnumPropertyTagsSTL.h"
#include "expert/QVGuardedSlot.h"
#include "expert/clocks/CPtpAttributeReader.h"
#include "expert/clocks/CPtpAttributeWriter.h"
#include "expert/clocks/CPtpLastFailure.h"
#include "platform/BStr.h"
#include "platform/DiscoveryInterfaces.h"
#include "platform/EthernetAdapters.h"
#include "platform/FindClocksTimeout.h"

using nQVPTPMGMT000::iPTPClockProxy;
using nQVPTPMGMT000::tPTPMgmtNode;

namespace {

using tTagEnumerator = CkxSysEnumPropertyTagsSTL<CPtpAttributeWriter::tTagSet>;

HRESULT newString(const char16_t* text, BSTR* out) {
    if (out == nullptr) {
        return E_POINTER;
    }
    *out = qv::dsc::BStr::allocate(text);
    return S_OK;
}

HRESULT createBag(CQVComPtr<IkxSysPropertyBag2>& bag) {
    CQVComObject<CkxDynamicPropertyBag>* created = nullptr;
    const HRESULT result = CQVComObject<CkxDynamicPropertyBag>::CreateInstance(&created);
    if (SUCCEEDED(result)) {
        bag = CQVComPtr<IkxSysPropertyBag2>(created);
    }
    return result;
}

std::u16string textOf(const OLECHAR* name) {
    return name == nullptr ? std::u16string() : std::u16string(name);
}

}  // namespace

std::span<const QVInterfaceEntry> CPtpSysExpert::InterfaceTable() {
    static constexpr QVInterfaceEntry kTable[] = {
        QVInterface<CPtpSysExpert, IkxSysExpert2>(IID_IkxSysExpert2),
        QVInterface<CPtpSysExpert, IkxSysExpert>(IID_IkxSysExpert),
        QVInterface<CPtpSysExpert, IkxQvLastFailure2>(IID_IkxQvLastFailure2),
        QVInterface<CPtpSysExpert, IkxQvLastFailure2>(IID_IkxQvLastFailure),
    };
    return kTable;
}

CPtpSysExpert::~CPtpSysExpert() = default;

HRESULT CPtpSysExpert::UseTransport(nQVPTP000::iPTPPortMessaging& transport) {
    std::lock_guard<std::mutex> guard(lifeLock_);
    if (ownedNode_) {
        return QV_E_ALREADY_INITIALIZED;
    }
    transport_ = &transport;
    return S_OK;
}

HRESULT CPtpSysExpert::GetExpertGUID(GUID* identifier) {
    if (identifier == nullptr) {
        return E_POINTER;
    }
    *identifier = CLSID_QvPtpSysExpert;
    return S_OK;
}

HRESULT CPtpSysExpert::GetDisplayName(BSTR* name) {
    return QVGuardedSlot([&] { return newString(kDisplayName, name); });
}

HRESULT CPtpSysExpert::GetVersionString(BSTR* version) {
    return QVGuardedSlot([&] {
        char text[40];
        std::snprintf(text, sizeof text, "%u.%u.%u", kVersion[0], kVersion[1], kVersion[2]);
        const std::u16string wide(text, text + std::char_traits<char>::length(text));
        return newString(wide.c_str(), version);
    });
}

HRESULT CPtpSysExpert::GetShortName(BSTR* name) {
    return QVGuardedSlot([&] { return newString(kShortName, name); });
}

HRESULT CPtpSysExpert::Initialize() {
    return QVGuardedSlot([&]() -> HRESULT {
        std::lock_guard<std::mutex> guard(lifeLock_);
        CPtpLastFailure::clear();
        if (ownedNode_) {
            return QV_E_ALREADY_INITIALIZED;
        }
        if (!chooseInterfaces()) {
            return E_FAIL;
        }
        const auto portNumber = static_cast<std::uint16_t>(::getpid() & 0xFFFF);
        const auto identity = qv::dsc::osdep::EthernetAdapters::localClockIdentity();
        tStatus status;
        auto node = std::make_unique<tPTPMgmtNode>(
            transport_, nQVPTP000::tClockIdentity(identity.data()), portNumber, status);
        discoveryTimeout_ = qv::dsc::osdep::FindClocksTimeout::read();
        node->open(status);
        if (status.failed()) {
            // Nothing half-open stays behind: a later Initialize may try again.
            CPtpLastFailure::record("opening the management node", status);
            tStatus closing;
            node->close(closing);
            return E_FAIL;
        }
        ownedNode_ = std::move(node);
        node_.store(ownedNode_.get(), std::memory_order_release);
        return S_OK;
    });
}

HRESULT CPtpSysExpert::Shutdown() {
    return QVGuardedSlot([&]() -> HRESULT {
        std::lock_guard<std::mutex> guard(lifeLock_);
        if (!ownedNode_) {
            return S_OK;
        }
        tStatus status;
        ownedNode_->close(status);
        return status.failed() ? E_FAIL : S_OK;
    });
}

// The interfaces that the setting names, for the UDP interface to open on; none without it.
// A name that is no interface able to multicast fails, rather than searching nowhere.
bool CPtpSysExpert::chooseInterfaces() {
    using qv::dsc::osdep::DiscoveryInterfaces;
    std::string unknown;
    auto chosen = DiscoveryInterfaces::choose(DiscoveryInterfaces::read(),
                                              qv::dsc::osdep::MulticastInterfaces::list(), unknown);
    if (!unknown.empty()) {
        const std::string what = "the interface '" + unknown + "' named in the setting \"" +
                                 DiscoveryInterfaces::kValueName +
                                 "\" is not up, has no IPv4 address or cannot multicast";
        CPtpLastFailure::record(what.c_str(), tStatus());
        return false;
    }
    udp_.useInterfaces(std::move(chosen));
    return true;
}

bool CPtpSysExpert::refreshClockList() {
    tStatus status;
    if (clocks_.refresh(*openNode(), discoveryTimeout_.load(), status)) {
        return true;
    }
    CPtpLastFailure::record("discovery", status);
    return false;
}

HRESULT CPtpSysExpert::itemBag(const std::u16string& name, IkxSysPropertyBag2** bag) {
    CQVComPtr<IkxSysPropertyBag2> created;
    HRESULT result = createBag(created);
    if (FAILED(result)) {
        return result;
    }
    result = CPtpAttributeReader::fillBaseProperties(name, CPtpClockList::lookup(*openNode(), name),
                                                     *created.get());
    if (SUCCEEDED(result)) {
        *bag = created.Detach();
    }
    return result;
}

HRESULT CPtpSysExpert::EnumerateItems(IkxSysItemCollector* collector) {
    return QVGuardedSlot([&]() -> HRESULT {
        CPtpLastFailure::clear();
        if (collector == nullptr) {
            return E_POINTER;
        }
        if (openNode() == nullptr) {
            return E_NOT_VALID_STATE;
        }
        if (!refreshClockList()) {
            return S_FALSE;
        }
        bool added = false;
        for (const std::u16string& name : clocks_.names()) {
            IkxSysPropertyBag2* bag = nullptr;
            const HRESULT result = itemBag(name, &bag);
            if (result == E_OUTOFMEMORY) {
                return result;
            }
            if (SUCCEEDED(result)) {
                collector->AddItem(bag);
                bag->Release();
                added = true;
            }
        }
        return added ? S_OK : S_FALSE;
    });
}

HRESULT CPtpSysExpert::GetItemNames(IkxSysEnumStringList** names) {
    return QVGuardedSlot([&]() -> HRESULT {
        CPtpLastFailure::clear();
        if (names == nullptr) {
            return E_POINTER;
        }
        if (openNode() == nullptr) {
            return E_NOT_VALID_STATE;
        }
        if (!refreshClockList()) {
            return S_FALSE;
        }
        auto list = std::make_unique<CkxSysEnumItemNamesSTL::NameList>(clocks_.names());
        if (list->empty()) {
            return S_FALSE;
        }
        CQVComObject<CkxSysEnumItemNamesSTL>* enumerator = nullptr;
        const HRESULT result = CQVComObject<CkxSysEnumItemNamesSTL>::CreateInstance(&enumerator);
        if (FAILED(result)) {
            return result;
        }
        CQVComPtr<IkxSysEnumStringList> held(enumerator);
        enumerator->Adopt(std::move(list));
        *names = held.Detach();
        return S_OK;
    });
}

HRESULT CPtpSysExpert::GetItem(const OLECHAR* name, IkxSysPropertyBag** item) {
    return QVGuardedSlot([&]() -> HRESULT {
        CPtpLastFailure::clear();
        if (item == nullptr) {
            return E_POINTER;
        }
        *item = nullptr;
        tPTPMgmtNode* node = openNode();
        if (node == nullptr) {
            return E_NOT_VALID_STATE;
        }
        const std::u16string itemName = textOf(name);
        // An unknown name is asked for by name: the answer ends the wait.
        iPTPClockProxy* proxy = CPtpClockList::lookup(*node, itemName);
        tStatus status;
        if (proxy == nullptr &&
            !clocks_.ask(*node, itemName, discoveryTimeout_.load(), proxy, status)) {
            CPtpLastFailure::record("looking up the item by name", status);
            return E_FAIL;
        }
        if (proxy == nullptr) {
            return CORBEL_E_ITEM_NOT_FOUND;
        }
        IkxSysPropertyBag2* bag = nullptr;
        const HRESULT result = itemBag(itemName, &bag);
        *item = bag;
        return result;
    });
}

HRESULT CPtpSysExpert::GetItemProperties(const OLECHAR* name, ULONG count,
                                         const kxSysAttributeTagID* tags, void* /*reserved*/,
                                         IkxSysPropertyBag** properties) {
    return QVGuardedSlot([&]() -> HRESULT {
        CPtpLastFailure::clear();
        if (properties == nullptr || (tags == nullptr && count != 0)) {
            return E_POINTER;
        }
        *properties = nullptr;
        tPTPMgmtNode* node = openNode();
        if (node == nullptr) {
            return E_NOT_VALID_STATE;
        }
        iPTPClockProxy* proxy = CPtpClockList::lookup(*node, textOf(name));
        if (proxy == nullptr) {
            return CORBEL_E_ITEM_NOT_FOUND;
        }
        CQVComPtr<IkxSysPropertyBag2> bag;
        const HRESULT created = createBag(bag);
        if (FAILED(created)) {
            return created;
        }
        tStatus failure;
        const HRESULT result =
            CPtpAttributeReader::readRequested(*proxy, count, tags, *bag.get(), failure);
        if (result == E_FAIL) {
            CPtpLastFailure::record("reading the clock's attributes", failure);
        }
        *properties = bag.Detach();
        return result;
    });
}

HRESULT CPtpSysExpert::ReservedOperation1(void* /*reserved*/) {
    return E_NOTIMPL;
}

HRESULT CPtpSysExpert::ReservedOperation2(void* /*reserved*/) {
    return E_NOTIMPL;
}

HRESULT CPtpSysExpert::ValidateChanges(const OLECHAR* /*name*/, IkxSysPropertyBag* changes,
                                       IkxSysEnumPropertyTag** accepted, BSTR* message) {
    return QVGuardedSlot([&]() -> HRESULT {
        CPtpLastFailure::clear();
        if (message != nullptr) {
            *message = nullptr;
        }
        if (accepted == nullptr) {
            return E_POINTER;
        }
        *accepted = nullptr;
        if (changes == nullptr) {
            return E_POINTER;
        }
        auto tags = std::make_unique<CPtpAttributeWriter::tTagSet>();
        std::u16string sentences;
        const HRESULT result = CPtpAttributeWriter::validate(*changes, *tags, sentences);
        if (result == CORBEL_E_INVALID_VALUE && message != nullptr) {
            *message = qv::dsc::BStr::allocate(sentences.c_str());
        }
        if (result != S_OK) {
            return result;
        }
        CQVComObject<tTagEnumerator>* enumerator = nullptr;
        const HRESULT created = CQVComObject<tTagEnumerator>::CreateInstance(&enumerator);
        if (FAILED(created)) {
            return created;
        }
        CQVComPtr<IkxSysEnumPropertyTag> held(enumerator);
        enumerator->Adopt(std::move(tags));
        *accepted = held.Detach();
        return S_OK;
    });
}

HRESULT CPtpSysExpert::ApplyChanges(const OLECHAR* name, IkxSysPropertyBag* changes,
                                    ULONG* result) {
    return QVGuardedSlot([&]() -> HRESULT {
        CPtpLastFailure::clear();
        if (changes == nullptr) {
            return E_POINTER;
        }
        if (result != nullptr) {
            *result = 0;
        }
        tPTPMgmtNode* node = openNode();
        if (node == nullptr) {
            return E_NOT_VALID_STATE;
        }
        const std::u16string itemName = textOf(name);
        CPtpAttributeWriter::tApplyFailure failure;
        // An unknown item fails as a write that could not be made: E_FAIL.
        const HRESULT applied = CPtpAttributeWriter::apply(
            *changes, [&] { return CPtpClockList::lookup(*node, itemName); }, failure);
        if (applied == CORBEL_E_INVALID_VALUE) {
            CPtpLastFailure::recordInvalid(failure.tag, failure.sentence);
        } else if (applied == E_FAIL) {
            const kxQvAttribute* row = kxQvFindAttribute(failure.tag);
            const std::string step = failure.status.failed()
                                         ? std::string("writing ") +
                                               (row != nullptr ? row->name : "a value") +
                                               " to the clock"
                                         : std::string("no clock is known under the item name");
            CPtpLastFailure::record(step.c_str(), failure.status, failure.tag);
        }
        return applied;
    });
}

HRESULT CPtpSysExpert::GetLastFailure(BSTR* description, BSTR* trace) {
    return QVGuardedSlot([&] { return CPtpLastFailure::get(description, trace); });
}

HRESULT CPtpSysExpert::GetLastFailureCause(ULONG* kind, ULONG* managementErrorId,
                                           kxSysAttributeTagID* tag) {
    return CPtpLastFailure::getCause(kind, managementErrorId, tag);
}
