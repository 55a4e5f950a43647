#include "corbel/ItemReader.h"

#include <algorithm>

#include "corbel/ComPtr.h"
#include "corbel/ReadGroups.h"
#include "corbel/TagCatalog.h"
#include "corbel/WideText.h"

namespace corbel {

namespace {

bool isWanted(kxSysAttributeTagID tag, const std::vector<kxSysAttributeTagID>& wanted,
              bool withBase) {
    if (!wanted.empty()) {
        return std::ranges::find(wanted, tag) != wanted.end();
    }
    const TagInfo* info = findTag(tag);
    return withBase || info == nullptr || !isBaseTag(*info);
}

}  // namespace

ExitCode ItemReading::outcome(bool tagsNamed) const {
    if (lookupFailure) {
        return exitCodeOf(lookupFailure->result, lookupFailure->kind);
    }
    for (const auto& [tag, cause] : unread) {
        if (tagsNamed || !cause.notSupported()) {
            return ExitCode::kFailed;
        }
    }
    return ExitCode::kSuccess;
}

std::vector<kxSysAttributeTagID> ItemReading::tagsInOrder() const {
    std::vector<kxSysAttributeTagID> tags;
    for (const auto& [tag, value] : values) {
        tags.push_back(tag);
    }
    for (const auto& [tag, cause] : unread) {
        tags.push_back(tag);
    }
    std::ranges::sort(tags, {}, catalogOrder);
    return tags;
}

ItemReading ItemReader::read(const std::string& item,
                             const std::vector<kxSysAttributeTagID>& wanted, bool withBase) const {
    ItemReading reading{item, std::nullopt, {}, {}};
    const auto name = toUtf16(item);
    ComPtr<IkxSysPropertyBag> base;
    const HRESULT found = expert_.GetItem(name.c_str(), base.out());
    if (FAILED(found) || !base) {
        reading.lookupFailure = FailureCause::last(expert_, FAILED(found) ? found : E_POINTER);
        return reading;
    }
    reading.values = readBag(*base);
    std::optional<FailureCause> silent;  // the clock stopped answering
    for (const ReadGroup& group : readGroups()) {
        std::vector<kxSysAttributeTagID> tags;
        std::ranges::copy_if(group.tags, std::back_inserter(tags),
                             [&](kxSysAttributeTagID tag) { return isWanted(tag, wanted, false); });
        if (tags.empty()) {
            continue;
        }
        ComPtr<IkxSysPropertyBag> bag;
        const HRESULT result =
            silent ? E_FAIL
                   : expert_.GetItemProperties(name.c_str(), static_cast<ULONG>(tags.size()),
                                               tags.data(), nullptr, bag.out());
        if (FAILED(result)) {
            const FailureCause cause = silent ? *silent : FailureCause::last(expert_, result);
            if (cause.kind == kxQvFailureKind::noAnswer) {
                silent = cause;
            }
            for (const kxSysAttributeTagID tag : group.tags) {
                reading.values.erase(tag);
                reading.unread.insert_or_assign(tag, cause);
            }
        } else if (bag) {
            for (auto& [tag, value] : readBag(*bag)) {
                reading.values.insert_or_assign(tag, std::move(value));
            }
        }
    }
    std::erase_if(reading.values,
                  [&](const auto& entry) { return !isWanted(entry.first, wanted, withBase); });
    std::erase_if(reading.unread,
                  [&](const auto& entry) { return !isWanted(entry.first, wanted, withBase); });
    return reading;
}

}  // namespace corbel
