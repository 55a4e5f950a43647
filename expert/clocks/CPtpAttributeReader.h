#ifndef QV_EXPERT_CLOCKS_CPTPATTRIBUTEREADER_H
#define QV_EXPERT_CLOCKS_CPTPATTRIBUTEREADER_H

#include <string>

#include "expert/clocks/CPtpBagFiller.h"
#include "platform/tStatus.h"
#include "ptpmgmt/iPTPClockProxy.h"
#include "qv1588/qv1588.h"

// Reads a clock port's attributes into a bag: the item's base properties, and the tags a
// host asks for, one management GET per source in the order of kxQvSource.
class CPtpAttributeReader {
  public:
    // The constant tags (the item names spelt from the clock's port identity), then (with a
    // clock) the cached clock description. CORBEL_E_ITEM_NOT_FOUND without a clock (the
    // constants stay, named `itemName`), E_FAIL when the description cannot be read.
    static HRESULT fillBaseProperties(const std::u16string& itemName,
                                      nQVPTPMGMT000::iPTPClockProxy* proxy,
                                      IkxSysPropertyBag2& bag);

    // Every source that holds a requested tag is asked once and sets all its tags. 0 when
    // every tag was served, E_OUTOFMEMORY when a group's values could not be stored, E_FAIL
    // when a request failed (the bag keeps what every other group read),
    // CORBEL_E_TAG_NOT_FOUND when none was served and none is a base tag, else S_FALSE.
    // `failure` receives the status of the first request that failed.
    static HRESULT readRequested(nQVPTPMGMT000::iPTPClockProxy& proxy, ULONG count,
                                 const kxSysAttributeTagID* tags, IkxSysPropertyBag2& bag,
                                 tStatus& failure);

    // The clock-description tags, after asking the port again when `refresh`.
    static void readDescription(nQVPTPMGMT000::iPTPClockProxy& proxy, bool refresh,
                                CPtpBagFiller& bag, tStatus& status);
};

#endif
