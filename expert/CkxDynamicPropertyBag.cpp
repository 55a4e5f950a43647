#include "expert/CkxDynamicPropertyBag.h"

#include <array>
#include <cstddef>
#include <utility>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "expert/CkxDateTimeFields.h"
#include "expert/CkxSysEnumPropertyTagsSTL.h"
#include "expert/CkxTemplatePropertyValue.h"
#include "expert/QVCreateEnumerator.h"
#include "expert/QVGuardedSlot.h"

namespace {

using Timestamp = kxSysAttrTimestampUTC;

}  // namespace

std::span<const QVInterfaceEntry> CkxDynamicPropertyBag::InterfaceTable() {
    static constexpr QVInterfaceEntry kTable[] = {
        QVInterface<CkxDynamicPropertyBag, IkxSysPropertyBag>(IID_IkxSysPropertyBag),
        QVInterface<CkxDynamicPropertyBag, IkxSysPropertyBag2>(IID_IkxSysPropertyBag2)};
    return kTable;
}

CkxDynamicPropertyBag::~CkxDynamicPropertyBag() = default;

template <class T>
HRESULT CkxDynamicPropertyBag::store(kxSysAttributeTagID tag, T value) {
    const auto found = values_.find(tag);
    if (found == values_.end()) {
        const auto inserted =
            values_.emplace(tag, std::make_unique<CkxTemplatePropertyValue<T>>(std::move(value)))
                .first;
        try {
            changed_.insert(tag);
        } catch (...) {
            values_.erase(inserted);
            throw;
        }
        return S_OK;
    }
    if (found->second->type() != CkxTemplatePropertyValue<T>::kTypeCode) {
        return CORBEL_E_TYPE_MISMATCH;
    }
    changed_.insert(tag);
    static_cast<CkxTemplatePropertyValue<T>&>(*found->second).assign(std::move(value));
    return S_OK;
}

template <class T>
HRESULT CkxDynamicPropertyBag::lookup(kxSysAttributeTagID tag, const T** value) const {
    const auto found = values_.find(tag);
    if (found == values_.end()) {
        return CORBEL_E_TAG_NOT_FOUND;
    }
    if (found->second->type() != CkxTemplatePropertyValue<T>::kTypeCode) {
        return CORBEL_E_TYPE_MISMATCH;
    }
    *value = &static_cast<const CkxTemplatePropertyValue<T>&>(*found->second).value();
    return S_OK;
}

// The getters whose out value is written only on success.
template <class T>
HRESULT CkxDynamicPropertyBag::getCopy(kxSysAttributeTagID tag, T* value) const {
    if (value == nullptr) {
        return E_POINTER;
    }
    const T* stored = nullptr;
    const HRESULT result = lookup(tag, &stored);
    if (SUCCEEDED(result)) {
        *value = *stored;
    }
    return result;
}

template <class T>
HRESULT CkxDynamicPropertyBag::copyValue(CkxDynamicPropertyBag& to, kxSysAttributeTagID tag,
                                         const CkxPropertyValue& from) {
    return to.store<T>(tag, static_cast<const CkxTemplatePropertyValue<T>&>(from).value());
}

// One copier per type, in type-code order.
std::span<const CkxDynamicPropertyBag::Copier> CkxDynamicPropertyBag::copiers() {
    static constexpr auto kCopiers =
        []<std::size_t... positions>(std::index_sequence<positions...>) {
        return std::array<Copier, sizeof...(positions)>{
            &copyValue<std::tuple_element_t<positions, CkxPropertyValueTypes>>...};
    }
    (std::make_index_sequence<std::tuple_size_v<CkxPropertyValueTypes>>());
    return kCopiers;
}

HRESULT CkxDynamicPropertyBag::EnumerateTags(IkxSysEnumPropertyTag** tags) {
    if (tags != nullptr && values_.empty()) {
        *tags = nullptr;
        return S_FALSE;
    }
    return QVCreateEnumerator<CkxSysEnumPropertyTagsSTL<ValueMap>>(this, values_, tags);
}

HRESULT CkxDynamicPropertyBag::HasTag(kxSysAttributeTagID tag) {
    return values_.contains(tag) ? S_OK : S_FALSE;
}

HRESULT CkxDynamicPropertyBag::GetTagType(kxSysAttributeTagID tag, ULONG* type) {
    if (type == nullptr) {
        return E_POINTER;
    }
    const auto found = values_.find(tag);
    if (found == values_.end()) {
        return CORBEL_E_TAG_NOT_FOUND;
    }
    *type = found->second->type();
    return S_OK;
}

HRESULT CkxDynamicPropertyBag::RemoveTag(kxSysAttributeTagID tag) {
    return values_.erase(tag) == 0 ? CORBEL_E_TAG_NOT_FOUND : S_OK;
}

HRESULT CkxDynamicPropertyBag::RemoveAllTags() {
    values_.clear();
    return S_OK;
}

HRESULT CkxDynamicPropertyBag::SetBool(kxSysAttributeTagID tag, BOOL value) {
    return QVGuardedSlot([&] { return store<bool>(tag, value != 0); });
}

HRESULT CkxDynamicPropertyBag::SetLong(kxSysAttributeTagID tag, LONG value) {
    return QVGuardedSlot([&] { return store<LONG>(tag, value); });
}

HRESULT CkxDynamicPropertyBag::SetULong(kxSysAttributeTagID tag, ULONG value) {
    return QVGuardedSlot([&] { return store<ULONG>(tag, value); });
}

HRESULT CkxDynamicPropertyBag::SetDouble(kxSysAttributeTagID tag, double value) {
    return QVGuardedSlot([&] { return store<double>(tag, value); });
}

HRESULT CkxDynamicPropertyBag::SetGUID(kxSysAttributeTagID tag, const GUID* value) {
    if (value == nullptr) {
        return E_POINTER;
    }
    return QVGuardedSlot([&] { return store<GUID>(tag, *value); });
}

HRESULT CkxDynamicPropertyBag::SetString(kxSysAttributeTagID tag, const OLECHAR* value) {
    return QVGuardedSlot([&] {
        // The type is checked before the copy is made, so that a mismatch costs nothing.
        const CqvBStr* stored = nullptr;
        const HRESULT existing = lookup(tag, &stored);
        if (existing == CORBEL_E_TYPE_MISMATCH) {
            return existing;
        }
        return store<CqvBStr>(tag, CqvBStr::copyOf(value));
    });
}

HRESULT CkxDynamicPropertyBag::SetDateTime(kxSysAttributeTagID tag, const LONG* fields) {
    if (fields == nullptr) {
        return E_POINTER;
    }
    return QVGuardedSlot(
        [&] { return store<Timestamp>(tag, CkxDateTimeFields::toTimestamp(fields)); });
}

HRESULT CkxDynamicPropertyBag::GetBool(kxSysAttributeTagID tag, BOOL* value) {
    if (value == nullptr) {
        return E_POINTER;
    }
    *value = 0;
    const bool* stored = nullptr;
    const HRESULT result = lookup(tag, &stored);
    if (SUCCEEDED(result)) {
        *value = *stored ? 1 : 0;
    }
    return result;
}

HRESULT CkxDynamicPropertyBag::GetLong(kxSysAttributeTagID tag, LONG* value) {
    return getCopy(tag, value);
}

HRESULT CkxDynamicPropertyBag::GetULong(kxSysAttributeTagID tag, ULONG* value) {
    return getCopy(tag, value);
}

HRESULT CkxDynamicPropertyBag::GetDouble(kxSysAttributeTagID tag, double* value) {
    return getCopy(tag, value);
}

HRESULT CkxDynamicPropertyBag::GetGUID(kxSysAttributeTagID tag, GUID* value) {
    return getCopy(tag, value);
}

HRESULT CkxDynamicPropertyBag::GetString(kxSysAttributeTagID tag, BSTR* value) {
    if (value == nullptr) {
        return E_POINTER;
    }
    *value = nullptr;
    return QVGuardedSlot([&] {
        const CqvBStr* stored = nullptr;
        const HRESULT result = lookup(tag, &stored);
        if (SUCCEEDED(result)) {
            *value = stored->copy();
        }
        return result;
    });
}

HRESULT CkxDynamicPropertyBag::GetDateTime(kxSysAttributeTagID tag, LONG* fields) {
    if (fields == nullptr) {
        return E_POINTER;
    }
    return QVGuardedSlot([&] {
        const Timestamp* stored = nullptr;
        const HRESULT result = lookup(tag, &stored);
        if (SUCCEEDED(result)) {
            CkxDateTimeFields::toFields(*stored, fields);
        }
        return result;
    });
}

HRESULT CkxDynamicPropertyBag::Clone(IkxSysPropertyBag2** copy) {
    if (copy == nullptr) {
        return E_POINTER;
    }
    *copy = nullptr;
    return QVGuardedSlot([&] {
        using Bag = CQVComObject<CkxDynamicPropertyBag>;
        Bag* created = nullptr;
        const HRESULT creation = Bag::CreateInstance(&created);
        if (FAILED(creation)) {
            return creation;
        }
        CQVComPtr<Bag> held(created);
        const std::span<const Copier> table = copiers();
        for (const auto& [tag, value] : values_) {
            const ULONG type = value->type();
            if (type == 0 || type > table.size()) {
                return E_FAIL;
            }
            const HRESULT copied = table[type - 1](*created, tag, *value);
            if (FAILED(copied)) {
                return copied;
            }
        }
        *copy = held.Detach();
        return S_OK;
    });
}

HRESULT CkxDynamicPropertyBag::ClearChangedTags() {
    if (changed_.empty()) {
        return S_FALSE;
    }
    changed_.clear();
    return S_OK;
}

HRESULT CkxDynamicPropertyBag::EnumerateChangedTags(IkxSysEnumPropertyTag** tags) {
    if (tags != nullptr && changed_.empty()) {
        *tags = nullptr;
        return S_FALSE;
    }
    return QVCreateEnumerator<CkxSysEnumPropertyTagsSTL<TagSet>>(this, changed_, tags);
}

HRESULT CkxDynamicPropertyBag::GetTimestamp(kxSysAttributeTagID tag, Timestamp* value) {
    return getCopy(tag, value);
}

HRESULT CkxDynamicPropertyBag::SetTimestamp(kxSysAttributeTagID tag, const Timestamp* value) {
    if (value == nullptr) {
        return E_POINTER;
    }
    return QVGuardedSlot([&] { return store<Timestamp>(tag, *value); });
}
