#include "corbel/serve/ExpertClockSource.h"

#include <algorithm>
#include <set>

#include "corbel/ChangeOutcome.h"
#include "corbel/Discovery.h"
#include "corbel/ItemReader.h"
#include "corbel/ReadGroups.h"
#include "corbel/WideText.h"

namespace corbel {

namespace {

// The expert's sentences end with two spaces each.
std::string trimmed(std::string sentence) {
    sentence.erase(sentence.find_last_not_of(' ') + 1);
    return sentence;
}

std::vector<std::string> namesOf(const std::vector<kxSysAttributeTagID>& tags) {
    std::vector<std::string> names;
    for (const kxSysAttributeTagID tag : tags) {
        names.push_back(tagName(tag));
    }
    return names;
}

// Every tag but those of the skipped groups, and but the base ones unless `withBase`.
std::vector<kxSysAttributeTagID> tagsToRead(const std::vector<std::size_t>& skipGroups,
                                            bool withBase) {
    std::set<kxSysAttributeTagID> skipped;
    for (const std::size_t group : skipGroups) {
        skipped.insert(readGroups()[group].tags.begin(), readGroups()[group].tags.end());
    }
    std::vector<kxSysAttributeTagID> tags;
    for (const TagInfo& info : allTags()) {
        if (!skipped.contains(info.tag) && (withBase || !isBaseTag(info))) {
            tags.push_back(info.tag);
        }
    }
    return tags;
}

}  // namespace

DiscoveryOutcome ExpertClockSource::discover() {
    Discovery discovery = Discovery::run(expert_);
    std::ranges::sort(discovery.items);
    DiscoveryOutcome outcome{std::move(discovery.items), {}};
    if (discovery.failed()) {
        outcome.failedExchanges.push_back(discovery.failure);
    }
    return outcome;
}

// What the reading tells of each group: read, refused for good, or why not.
ClockReading ExpertClockSource::read(const std::string& item,
                                     const std::vector<std::size_t>& skipGroups, bool withBase) {
    ItemReading reading = ItemReader(expert_).read(item, tagsToRead(skipGroups, withBase));
    ClockReading result{std::move(reading.values), std::move(reading.unread), {}, {}, false};
    if (reading.lookupFailure) {
        result.failedExchanges.push_back(*reading.lookupFailure);
        return result;
    }
    const auto& groups = readGroups();
    bool silent = false;  // a clock that stops answering is asked no further in a reading
    for (std::size_t index = 0; index < groups.size(); ++index) {
        const auto& tags = groups[index].tags;
        const auto unread = tags.empty() ? result.unread.end() : result.unread.find(tags.front());
        if (unread == result.unread.end()) {
            result.answered =
                result.answered || (!tags.empty() && result.values.contains(tags.front()));
            continue;
        }
        const FailureCause& cause = unread->second;
        result.answered = result.answered || cause.kind == kxQvFailureKind::refusedByClock;
        if (cause.notSupported()) {
            result.unsupportedGroups.push_back(index);
        }
        if (!silent) {
            result.failedExchanges.push_back(cause);
        }
        silent = silent || cause.kind == kxQvFailureKind::noAnswer;
    }
    return result;
}

ComPtr<IkxSysPropertyBag2> ExpertClockSource::changeBag(const std::basic_string<OLECHAR>& item,
                                                        const std::vector<Setting>& settings,
                                                        FailureCause& failure) const {
    ComPtr<IkxSysPropertyBag> base;
    const HRESULT found = expert_.GetItem(item.c_str(), base.out());
    if (FAILED(found) || !base) {
        failure = FailureCause::last(expert_, FAILED(found) ? found : E_POINTER);
        return {};
    }
    auto bag = base.query<IkxSysPropertyBag2>(IID_IkxSysPropertyBag2);
    if (!bag || FAILED(bag->ClearChangedTags())) {
        failure = FailureCause::of(E_NOINTERFACE);
        return {};
    }
    for (const Setting& setting : settings) {
        if (const HRESULT stored = storeValue(*bag, setting.tag->tag, setting.value);
            FAILED(stored)) {
            failure = FailureCause::of(stored);
            return {};
        }
    }
    return bag;
}

WriteOutcome ExpertClockSource::write(const std::string& item,
                                      const std::vector<Setting>& settings) {
    WriteOutcome outcome;
    const std::basic_string<OLECHAR> name = toUtf16(item);
    FailureCause failure;
    const auto bag = changeBag(name, settings, failure);
    if (!bag) {
        outcome.result = WriteOutcome::Result::refused;
        outcome.reason = failure.words();
        outcome.failedExchanges.push_back(failure);
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
void ExpertClockSource::reject(const std::basic_string<OLECHAR>& item,
                               const std::vector<Setting>& settings, WriteOutcome& outcome) const {
    outcome.result = WriteOutcome::Result::rejected;
    for (const Setting& setting : settings) {
        FailureCause failure;
        const auto bag = changeBag(item, {setting}, failure);
        ComPtr<IkxSysEnumPropertyTag> accepted;
        OwnedBstr message;
        if (bag && expert_.ValidateChanges(item.c_str(), bag.get(), accepted.out(),
                                           message.out()) == CORBEL_E_INVALID_VALUE) {
            outcome.sentences[setting.tag->name] = trimmed(message.utf8());
        }
    }
}

void ExpertClockSource::apply(const std::basic_string<OLECHAR>& item,
                              const std::vector<Setting>& settings, IkxSysPropertyBag2& bag,
                              WriteOutcome& outcome) const {
    ULONG ignored = 0;
    const HRESULT applied = expert_.ApplyChanges(item.c_str(), &bag, &ignored);
    const FailureCause cause =
        FAILED(applied) ? FailureCause::last(expert_, applied) : FailureCause::of(applied);
    std::vector<kxSysAttributeTagID> changed;
    for (const Setting& setting : settings) {
        changed.push_back(setting.tag->tag);
    }
    const ChangeOutcome change = ChangeOutcome::of(changed, cause);
    outcome.written = namesOf(change.written);
    if (SUCCEEDED(applied)) {
        return;
    }
    outcome.failedExchanges.push_back(cause);
    outcome.result = WriteOutcome::Result::refused;
    outcome.reason = cause.words();
    outcome.refusedTag = change.failed ? tagName(*change.failed) : std::string();
    // Where the expert does not say where it stopped, none is known written.
    outcome.notSent = namesOf(change.failed ? change.notSent : change.unknown);
}

}  // namespace corbel
