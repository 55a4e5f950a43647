#ifndef QV_CORBEL_ITEMREADER_H
#define QV_CORBEL_ITEMREADER_H

#include <qv1588/qv1588.h>

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "corbel/ExitCode.h"
#include "corbel/FailureCause.h"
#include "corbel/PropertyValue.h"

namespace corbel {

// One clock port as read through the expert: the values it gave and, for each tag it did
// not give, why.
struct ItemReading {
    std::string item;
    // Set when the item itself cannot be had (no clock answers to the name): nothing else is.
    std::optional<FailureCause> lookupFailure;
    PropertyValues values;
    std::map<kxSysAttributeTagID, FailureCause> unread;

    // How a command that read it ends: it fails when the item cannot be had, when the clock
    // did not answer or refused for another reason than lacking the data, and, with
    // `tagsNamed` (the user asked for these tags), when any tag is missing.
    ExitCode outcome(bool tagsNamed) const;

    // The tags read and unread, in the order in which views list them (catalogOrder).
    std::vector<kxSysAttributeTagID> tagsInOrder() const;
};

// Reads items through an expert, one request per group of tags (ReadGroups), so that a
// group the clock refuses is known by name and the others are still read. After a clock
// fails to answer one request it is not asked again within the same reading: each request
// would wait the expert's whole exchange time-out.
class ItemReader {
  public:
    explicit ItemReader(IkxSysExpert2& expert) : expert_(expert) {}

    // `wanted` empty: every tag, without the base tags unless `withBase`; otherwise those
    // tags alone.
    ItemReading read(const std::string& item, const std::vector<kxSysAttributeTagID>& wanted,
                     bool withBase = false) const;

  private:
    IkxSysExpert2& expert_;
};

}  // namespace corbel

#endif
