#ifndef QV_CORBEL_ITEMCOLLECTOR_H
#define QV_CORBEL_ITEMCOLLECTOR_H

#include <qv1588/corbel.h>

#include <atomic>
#include <vector>

#include "corbel/PropertyValue.h"

namespace corbel {

// The receiver that EnumerateItems hands each item's bag to. It copies the values at once
// and keeps no bag. It lives on the caller's stack for one EnumerateItems call, so its
// reference count only counts: the expert must not keep it beyond the call.
class ItemCollector final : public IkxSysItemCollector {
  public:
    ItemCollector() = default;
    virtual ~ItemCollector() = default;
    ItemCollector(const ItemCollector&) = delete;
    ItemCollector& operator=(const ItemCollector&) = delete;

    HRESULT KXSYS_CALL QueryInterface(const IID& iid, void** object) override;
    ULONG KXSYS_CALL AddRef() override;
    ULONG KXSYS_CALL Release() override;
    HRESULT KXSYS_CALL ReservedCollector1() override;
    HRESULT KXSYS_CALL ReservedCollector2() override;
    HRESULT KXSYS_CALL AddItem(IkxSysPropertyBag* item) override;

    const std::vector<PropertyValues>& items() const { return items_; }

  private:
    std::vector<PropertyValues> items_;
    std::atomic<ULONG> references_{1};
};

}  // namespace corbel

#endif
