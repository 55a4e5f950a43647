#include "corbel/Discovery.h"

#include "corbel/ComPtr.h"
#include "corbel/WideText.h"

namespace corbel {

namespace {

std::vector<std::string> namesOf(IkxSysEnumStringList& names) {
    std::vector<std::string> result;
    BSTR batch[16] = {};
    ULONG fetched = 0;
    while (SUCCEEDED(names.Next(16, batch, &fetched)) && fetched > 0) {
        for (ULONG i = 0; i < fetched; ++i) {
            result.push_back(toUtf8(batch[i] == nullptr ? OLESTR("") : batch[i]));
            SysFreeString(batch[i]);
        }
        fetched = 0;
    }
    return result;
}

}  // namespace

Discovery Discovery::run(IkxSysExpert2& expert) {
    Discovery discovery;
    ComPtr<IkxSysEnumStringList> enumerator;
    const HRESULT result = expert.GetItemNames(enumerator.out());
    if (result == S_OK && enumerator) {
        discovery.items = namesOf(*enumerator);
    }
    if (discovery.items.empty()) {
        discovery.failure = FailureCause::last(expert, result == S_OK ? S_FALSE : result);
    }
    return discovery;
}

}  // namespace corbel
