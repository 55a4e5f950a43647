#ifndef QV_TESTS_EXPERT_NETWORK_LOADEDEXPERT_H
#define QV_TESTS_EXPERT_NETWORK_LOADEDEXPERT_H

#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "qv1588/qv1588.h"
#include "tests/expert/clocks/BagText.h"
#include "tests/support/TestNetwork.h"

namespace qvtest {

// libqv1588.so as a host loads it: dlopen, then the one export by name.
class LoadedExpert {
  public:
    LoadedExpert();
    ~LoadedExpert();
    LoadedExpert(const LoadedExpert&) = delete;
    LoadedExpert& operator=(const LoadedExpert&) = delete;

    // Null when the library or its export cannot be found (failure() says why).
    createCorbelExpertFunction create() const { return create_; }
    const std::string& failure() const { return failure_; }

  private:
    void* library_ = nullptr;
    createCorbelExpertFunction create_ = nullptr;
    std::string failure_;
};

// What pmc prints for one GET of `clock` in its domain: name -> value text.
std::map<std::string, std::string> pmcValues(const TestNetwork& network, const TestClock& clock,
                                             const std::string& managementId);

// The item names that GetItemNames gives (none when it finds no clock).
std::vector<std::u16string> itemNames(IkxSysExpert2& expert);

// Validates and applies what `change` sets in the bag that GetItem gives for `item`; the
// result of ApplyChanges, or GetItem's failure.
using tChange = std::function<void(IkxSysPropertyBag2&)>;
HRESULT writeChanges(IkxSysExpert2& expert, const std::u16string& item, const tChange& change);

// The management ids (decimal, one a line) of every SET and COMMAND that went out on each of
// the client's `bridges` while `action` ran, in the order of `bridges`.
std::vector<std::string> requestsSentDuring(const TestNetwork& network,
                                            const std::vector<std::string>& bridges,
                                            const std::function<void()>& action);

// The item name of a test clock's port, e.g. 02-00-00-FF-FE-00-00-01:1.
std::u16string itemNameOf(const TestClock& clock);

}  // namespace qvtest

#endif
