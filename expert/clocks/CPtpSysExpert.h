#ifndef QV_EXPERT_CLOCKS_CPTPSYSEXPERT_H
#define QV_EXPERT_CLOCKS_CPTPSYSEXPERT_H

#include <array>
#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>
#include <span>

#include "expert/CQVComMultiThreadModelNoCS.h"
#include "expert/CQVComObjectRootBase.h"
#include "expert/CQVComObjectRootEx.h"
#include "expert/clocks/CPtpClockList.h"
#include "ptp/transport/iPTPPortMessaging.h"
#include "ptp/transport/tUDPNetworkInterface.h"
#include "ptpmgmt/tPTPMgmtNode.h"
#include "qv1588/qv1588.h"

// The expert: every PTP clock port that answers management messages on the network is an
// item whose attributes the host reads and changes. Created as CQVComObject<CPtpSysExpert>.
//
// Why an operation failed is kept per calling thread (IkxQvLastFailure and its second
// version, CPtpLastFailure).
//
// Threads: the host may call every operation from several threads at once. Initialize and
// Shutdown are serialised by `lifeLock_`; item operations see the node only once it is open.
class CPtpSysExpert : public IkxSysExpert2,
                      public IkxQvLastFailure2,
                      public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    static constexpr const char16_t* kDisplayName = u"QV-1588 2008";
    static constexpr const char16_t* kShortName = u"qv-1588";
    static constexpr std::array<unsigned, 3> kVersion = {1, 0, 2};

    static std::span<const QVInterfaceEntry> InterfaceTable();

    // Makes the node send and receive through `transport` instead of the UDP interface.
    // Only before Initialize; the transport must outlive the expert.
    HRESULT UseTransport(nQVPTP000::iPTPPortMessaging& transport);

    HRESULT KXSYS_CALL GetExpertGUID(GUID* identifier) override;
    HRESULT KXSYS_CALL GetDisplayName(BSTR* name) override;
    HRESULT KXSYS_CALL GetVersionString(BSTR* version) override;
    HRESULT KXSYS_CALL GetShortName(BSTR* name) override;
    HRESULT KXSYS_CALL Initialize() override;
    HRESULT KXSYS_CALL Shutdown() override;
    HRESULT KXSYS_CALL EnumerateItems(IkxSysItemCollector* collector) override;
    HRESULT KXSYS_CALL GetItemNames(IkxSysEnumStringList** names) override;
    HRESULT KXSYS_CALL GetItem(const OLECHAR* name, IkxSysPropertyBag** item) override;
    HRESULT KXSYS_CALL GetItemProperties(const OLECHAR* name, ULONG count,
                                         const kxSysAttributeTagID* tags, void* reserved,
                                         IkxSysPropertyBag** properties) override;
    HRESULT KXSYS_CALL ReservedOperation1(void* reserved) override;
    HRESULT KXSYS_CALL ReservedOperation2(void* reserved) override;
    HRESULT KXSYS_CALL ValidateChanges(const OLECHAR* name, IkxSysPropertyBag* changes,
                                       IkxSysEnumPropertyTag** accepted, BSTR* message) override;
    HRESULT KXSYS_CALL ApplyChanges(const OLECHAR* name, IkxSysPropertyBag* changes,
                                    ULONG* result) override;
    HRESULT KXSYS_CALL GetLastFailure(BSTR* description, BSTR* trace) override;
    HRESULT KXSYS_CALL GetLastFailureCause(ULONG* kind, ULONG* managementErrorId,
                                           kxSysAttributeTagID* tag) override;

  protected:
    CPtpSysExpert() = default;
    virtual ~CPtpSysExpert();

  private:
    nQVPTPMGMT000::tPTPMgmtNode* openNode() const { return node_.load(std::memory_order_acquire); }
    bool chooseInterfaces();
    bool refreshClockList();
    HRESULT itemBag(const std::u16string& name, IkxSysPropertyBag2** bag);

    nQVPTP000::tUDPNetworkInterface udp_;  // its interfaces chosen by Initialize (lifeLock_)
    nQVPTP000::iPTPPortMessaging* transport_ = &udp_;  // guarded by lifeLock_
    std::mutex lifeLock_;
    std::unique_ptr<nQVPTPMGMT000::tPTPMgmtNode> ownedNode_;   // guarded by lifeLock_
    std::atomic<nQVPTPMGMT000::tPTPMgmtNode*> node_{nullptr};  // set once it is open
    CPtpClockList clocks_;
    std::atomic<std::uint16_t> discoveryTimeout_{1000};
};

#endif
