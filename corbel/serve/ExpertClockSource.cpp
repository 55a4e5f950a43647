#include "corbel/serve/ExpertClockSource.h"

#include <algorithm>

#include "corbel/ReadGroups.h"
#include "corbel/WideText.h"
#include "corbel/serve/ValueObjects.h"

namespace corbel {

namespace {

std::vector<std::string> namesOf(IkxSysEnumStringList& names) {
    std::vector<std::string> result;
    BSTR batch[16] = {};
    ULONG fetched = 0;
    while (SUCCEEDED(names.Next(16, batch, &fetched)) && fetched > 0) {
        for (ULONG i = 0; i < fetched; ++i) {
            result.push_back(toUtf8(batch[i] == nullptr ? u"" : batch[i]));
            SysFreeString(batch[i]);
        }
        fetched = 0;
    }
    return result;
}

// The expert's sentences end with two spaces each.
std::string trimmed(std::string sentence) {
    sentence.erase(sentence.find_last_not_of(' ') + 1);
    return sentence;
}

bool store(IkxSysPropertyBag2& bag, const std::vector<Setting>& settings) {
    return std::ranges::all_of(settings, [&bag](const Setting& setting) {
        return SUCCEEDED(storeValue(bag, setting.tag->tag, setting.value));
    });
}

}  // namespace

ReadFailure ExpertClockSource::lastFailure(kxSysAttributeTagID* tag) const {
    ReadFailure failure;
    const auto failures = queryInterface<IkxQvLastFailure2>(expert_, IID_IkxQvLastFailure2);
    if (!failures) {
        return failure;
    }
    ULONG kind = 0;
    OwnedBstr description;
    failures->GetLastFailureCause(&kind, &failure.managementErrorId, tag);
    failures->GetLastFailure(description.out(), nullptr);
    failure.kind = kind == 0 ? kxQvFailureKind::other : static_cast<kxQvFailureKind>(kind);
    failure.words = description.utf8();
    return failure;
}

DiscoveryOutcome ExpertClockSource::discover() {
    DiscoveryOutcome outcome;
    ComPtr<IkxSysEnumStringList> names;
    const HRESULT result = expert_.GetItemNames(names.out());
    if (result == S_OK && names) {
        outcome.items = namesOf(*names);
        std::ranges::sort(outcome.items);
    } else if (const ReadFailure failure = lastFailure(); !failure.words.empty()) {
        outcome.failedExchanges.push_back(failure);  // not a mere "nobody answered"
    }
    return outcome;
}

ClockReading ExpertClockSource::read(const std::string& item,
                                     const std::vector<std::size_t>& skipGroups, bool withBase) {
    ClockReading reading;
    const std::u16string name = toUtf16(item);
    if (withBase) {
        ComPtr<IkxSysPropertyBag> base;
        if (SUCCEEDED(expert_.GetItem(name.c_str(), base.out())) && base) {
            reading.values = readBag(*base);
        }
    }
    const auto& groups = readGroups();
    for (std::size_t index = 0; index < groups.size(); ++index) {
        const auto& tags = groups[index].tags;
        if (tags.empty() || std::ranges::find(skipGroups, index) != skipGroups.end()) {
            continue;
        }
        ComPtr<IkxSysPropertyBag> bag;
        const HRESULT result = expert_.GetItemProperties(
            name.c_str(), static_cast<ULONG>(tags.size()), tags.data(), nullptr, bag.out());
        if (FAILED(result)) {
            const ReadFailure failure = lastFailure();
            reading.failedExchanges.push_back(failure);
            for (const kxSysAttributeTagID tag : tags) {
                reading.unread[tag] = failure;
            }
            if (failure.notSupported()) {
                reading.unsupportedGroups.push_back(index);
            }
            // A clock that does not answer would make every further request wait the
            // expert's whole time-out.
            if (failure.kind != kxQvFailureKind::refusedByClock) {
                break;
            }
        }
        reading.answered = reading.answered || SUCCEEDED(result) ||
                           reading.failedExchanges.back().kind == kxQvFailureKind::refusedByClock;
        if (bag) {
            for (auto& [tag, value] : readBag(*bag)) {
                reading.values.insert_or_assign(tag, std::move(value));
            }
        }
    }
    return reading;
}

ComPtr<IkxSysPropertyBag2> ExpertClockSource::changeBag(const std::u16string& item,
                                                        ReadFailure& failure) const {
    ComPtr<IkxSysPropertyBag> base;
    if (FAILED(expert_.GetItem(item.c_str(), base.out())) || !base) {
        failure = lastFailure();
        return {};
    }
    auto bag = base.query<IkxSysPropertyBag2>(IID_IkxSysPropertyBag2);
    if (!bag || FAILED(bag->ClearChangedTags())) {
        failure.words = "the item's bag takes no changes";
        return {};
    }
    return bag;
}

WriteOutcome ExpertClockSource::write(const std::string& item,
                                      const std::vector<Setting>& unordered) {
    WriteOutcome outcome;
    std::vector<Setting> settings = unordered;  // ApplyChanges sends in ascending tag order
    std::ranges::sort(settings, {}, [](const Setting& setting) { return setting.tag->tag; });
    const std::u16string name = toUtf16(item);
    ReadFailure failure;
    const auto bag = changeBag(name, failure);
    if (!bag || !store(*bag, settings)) {
        outcome.result = WriteOutcome::Result::refused;
        outcome.reason = failure.words.empty() ? "the values cannot be stored" : failure.words;
        return outcome;
    }
    ComPtr<IkxSysEnumPropertyTag> accepted;
    OwnedBstr message;
    const HRESULT valid =
        expert_.ValidateChanges(name.c_str(), bag.get(), accepted.out(), message.out());
    if (valid == CORBEL_E_INVALID_VALUE) {
        reject(name, settings, outcome);
    } else {
        apply(name, settings, *bag, outcome);
    }
    return outcome;
}

// Each setting is validated alone, so that each sentence belongs to its setting.
void ExpertClockSource::reject(const std::u16string& item, const std::vector<Setting>& settings,
                               WriteOutcome& outcome) const {
    outcome.result = WriteOutcome::Result::rejected;
    for (const Setting& setting : settings) {
        ReadFailure failure;
        const auto bag = changeBag(item, failure);
        ComPtr<IkxSysEnumPropertyTag> accepted;
        OwnedBstr message;
        if (bag && store(*bag, {setting}) &&
            expert_.ValidateChanges(item.c_str(), bag.get(), accepted.out(), message.out()) ==
                CORBEL_E_INVALID_VALUE) {
            outcome.sentences[setting.tag->name] = trimmed(message.utf8());
        }
    }
}

void ExpertClockSource::apply(const std::u16string& item, const std::vector<Setting>& settings,
                              IkxSysPropertyBag2& bag, WriteOutcome& outcome) const {
    ULONG ignored = 0;
    if (SUCCEEDED(expert_.ApplyChanges(item.c_str(), &bag, &ignored))) {
        for (const Setting& setting : settings) {
            outcome.written.push_back(setting.tag->name);
        }
        return;
    }
    kxSysAttributeTagID stopped = 0;
    const ReadFailure failure = lastFailure(&stopped);
    outcome.failedExchanges.push_back(failure);
    outcome.result = WriteOutcome::Result::refused;
    outcome.reason = failureWords(failure);
    // Without the tag where it stopped, the first one is named: nothing is known written.
    if (stopped == 0) {
        stopped = settings.front().tag->tag;
    }
    for (const Setting& setting : settings) {
        if (setting.tag->tag < stopped) {
            outcome.written.push_back(setting.tag->name);
        } else if (setting.tag->tag == stopped) {
            outcome.refusedTag = setting.tag->name;
        } else {
            outcome.notSent.push_back(setting.tag->name);
        }
    }
}

}  // namespace corbel
