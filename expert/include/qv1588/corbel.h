#ifndef QV1588_CORBEL_H
#define QV1588_CORBEL_H

// The host boundary of the qv-1588 expert: the host framework's COM-style interfaces as the
// expert implements and calls them, their identifiers and result codes, and the one export
// `createCorbelExpert`. A host program compiles against this header alone.
//
// Binary contract: every interface is a single-inheritance chain of pure virtual operations,
// so an interface pointer points at a table of operations in declaration order ("slots",
// IUnknown's three first). Hosts may call by slot; the order below must never change.
//
// Reference counting: an interface pointer handed out through an out parameter carries one
// reference that the receiver gives back with Release. AddRef and Release are atomic, so
// references may be taken and given back on any thread.
//
// Strings: a BSTR points at the first UTF-16 code unit of a NUL-terminated text whose length
// in octets is stored in the four octets before it; a null BSTR is an empty text. The
// expert allocates every BSTR it hands out and the receiver frees it with SysFreeString.
//
// On Windows this header is the platform's own COM: IUnknown from <unknwn.h>, GUID, IID and
// REFIID, HRESULT and its codes, OLECHAR (wchar_t) and BSTR, and SysAllocString,
// SysFreeString and SysStringLen from oleaut32, so that a host's interface pointers and
// strings are the very same types; a host may include <windows.h> before or after it. Every
// BSTR comes from oleaut32 and goes back to it, on both sides. Elsewhere the header defines
// the same names itself, with char16_t as OLECHAR and a release of its own that matches
// the expert library's allocation (the C library's malloc, which both sides share).

#include <cstdint>

#ifdef _WIN32
#include <windows.h>
// After windows.h, which they need.
#include <oleauto.h>
#include <unknwn.h>

#define KXSYS_CALL STDMETHODCALLTYPE
#else
#include <cstdlib>
#include <cstring>

#define KXSYS_CALL

using HRESULT = std::int32_t;
using ULONG = std::uint32_t;
using LONG = std::int32_t;
using BOOL = std::int32_t;
using OLECHAR = char16_t;
using BSTR = OLECHAR*;
// A literal of the boundary's wide characters, as on Windows: OLESTR("clock").
#define OLESTR(text) u##text

struct GUID {
    std::uint32_t Data1;
    std::uint16_t Data2;
    std::uint16_t Data3;
    std::uint8_t Data4[8];
};
using IID = GUID;
using REFIID = const IID&;

inline bool operator==(const GUID& left, const GUID& right) {
    return std::memcmp(&left, &right, sizeof(GUID)) == 0;
}
inline bool operator!=(const GUID& left, const GUID& right) {
    return !(left == right);
}

// Result codes.
inline constexpr HRESULT S_OK = 0;
inline constexpr HRESULT S_FALSE = 1;  // nothing to report, or a request only partly served
inline constexpr HRESULT E_NOTIMPL = static_cast<HRESULT>(0x80004001u);
inline constexpr HRESULT E_NOINTERFACE = static_cast<HRESULT>(0x80004002u);
inline constexpr HRESULT E_POINTER = static_cast<HRESULT>(0x80004003u);
inline constexpr HRESULT E_FAIL = static_cast<HRESULT>(0x80004005u);
inline constexpr HRESULT E_OUTOFMEMORY = static_cast<HRESULT>(0x8007000Eu);

inline constexpr bool SUCCEEDED(HRESULT result) {
    return result >= 0;
}
inline constexpr bool FAILED(HRESULT result) {
    return result < 0;
}

inline constexpr IID IID_IUnknown = {
    0x00000000, 0x0000, 0x0000, {0xC0, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x46}};

// Interfaces have no virtual destructor (a host never deletes an interface pointer: it
// releases it); the destructor is protected so that nobody can.
struct IUnknown {
    virtual HRESULT KXSYS_CALL QueryInterface(REFIID iid, void** object) = 0;  // slot 0
    virtual ULONG KXSYS_CALL AddRef() = 0;                                     // slot 1
    virtual ULONG KXSYS_CALL Release() = 0;                                    // slot 2

  protected:
    ~IUnknown() = default;
};

// Frees a BSTR that the expert handed out: its block starts at the length prefix and comes
// from the C library's allocator.
inline void SysFreeString(BSTR text) {
    if (text != nullptr) {
        std::free(reinterpret_cast<std::uint8_t*>(text) - sizeof(std::uint32_t));
    }
}
// Code units of a BSTR, from its prefix (a null BSTR is empty).
inline ULONG SysStringLen(const OLECHAR* text) {
    std::uint32_t octets = 0;
    if (text != nullptr) {
        std::memcpy(&octets, reinterpret_cast<const std::uint8_t*>(text) - sizeof octets,
                    sizeof octets);
    }
    return static_cast<ULONG>(octets / sizeof(OLECHAR));
}
#endif

static_assert(sizeof(OLECHAR) == 2, "UTF-16 code units");
static_assert(sizeof(ULONG) == 4 && sizeof(LONG) == 4 && sizeof(BOOL) == 4);

// The host framework's own result codes.
// A tag holds a value of another type.
inline constexpr HRESULT CORBEL_E_TYPE_MISMATCH = static_cast<HRESULT>(0x80040370u);
inline constexpr HRESULT CORBEL_E_TAG_NOT_FOUND = static_cast<HRESULT>(0x80040371u);
// No clock answers to an item name.
inline constexpr HRESULT CORBEL_E_ITEM_NOT_FOUND = static_cast<HRESULT>(0x80040375u);
// A changed value failed validation.
inline constexpr HRESULT CORBEL_E_INVALID_VALUE = static_cast<HRESULT>(0x8004037Fu);

// Attribute tags: the expert's own at 0xE001000 to 0xE028000 in steps of 0x1000, the host's
// general ones at 0x1001000 to 0x1037000.
using kxSysAttributeTagID = std::uint32_t;

// A point in time: fraction of a second in units of 2^-64 s, then whole seconds since
// 1904-01-01 00:00:00 UTC. PTP seconds (since 1970) plus 2082844800 give `seconds`.
struct kxSysAttrTimestampUTC {
    std::uint64_t fraction;
    std::int64_t seconds;
};
static_assert(sizeof(kxSysAttrTimestampUTC) == 16);
static_assert(sizeof(GUID) == 16);

// The type codes of property values (IkxSysPropertyBag::GetTagType).
enum kxSysPropertyType : ULONG {
    kxSysPropertyTypeBool = 1,
    kxSysPropertyTypeLong = 2,   // signed 32-bit
    kxSysPropertyTypeULong = 3,  // unsigned 32-bit
    kxSysPropertyTypeDouble = 4,
    kxSysPropertyTypeGUID = 5,
    kxSysPropertyTypeString = 6,     // BSTR
    kxSysPropertyTypeTimestamp = 7,  // kxSysAttrTimestampUTC
};

// Interface identifiers.
inline constexpr IID IID_IkxSysExpert = {
    0x9C257614, 0x172D, 0x4D5D, {0x81, 0xBB, 0x3D, 0x4F, 0x72, 0xBD, 0x30, 0xA4}};
inline constexpr IID IID_IkxSysExpert2 = {
    0xCF3357AD, 0x3023, 0x4121, {0xA6, 0x0E, 0x2F, 0xF9, 0xB3, 0xA8, 0x7B, 0xEE}};
inline constexpr IID IID_IkxSysPropertyBag = {
    0x3E2F201D, 0xCABE, 0x466F, {0x93, 0xAE, 0x50, 0x22, 0x44, 0xC1, 0x8D, 0xDE}};
inline constexpr IID IID_IkxSysPropertyBag2 = {
    0xE275E061, 0x297B, 0x4463, {0xA5, 0xF1, 0x5D, 0x2D, 0x9D, 0x8F, 0x38, 0x98}};
inline constexpr IID IID_IkxSysEnumStringList = {
    0xFB09815D, 0x7F02, 0x459F, {0x87, 0xB8, 0x78, 0x22, 0x7B, 0xE8, 0x41, 0x26}};
inline constexpr IID IID_IkxSysEnumPropertyTag = {
    0xB21429CD, 0x0DDD, 0x48FA, {0x9D, 0xDD, 0x33, 0xA1, 0xCF, 0xA7, 0x9C, 0xDE}};
// The expert's own identifier (IkxSysExpertInfo::GetExpertGUID).
inline constexpr GUID CLSID_QvPtpSysExpert = {
    0x7B913AC1, 0x977C, 0x404B, {0x93, 0x13, 0x17, 0x78, 0xC1, 0xDC, 0xA6, 0xBA}};

#if defined(_WIN32) && defined(__GNUC__)
// The platform's IUnknown leaves its destructor public and non-virtual; each interface
// below makes its own protected, so that nobody deletes through an interface pointer.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wnon-virtual-dtor"
#endif

// Every interface below has IUnknown's three operations in slots 0 to 2 and a protected
// destructor: a host releases an interface pointer, never deletes it.

// Slots 3 to 6 of both enumerators.
struct IkxSysEnumStringList : IUnknown {
    // `fetched` may be null only when `count` is 1. Every delivered BSTR belongs to the caller.
    virtual HRESULT KXSYS_CALL Next(ULONG count, BSTR* names, ULONG* fetched) = 0;
    virtual HRESULT KXSYS_CALL Skip(ULONG count) = 0;
    virtual HRESULT KXSYS_CALL Reset() = 0;
    virtual HRESULT KXSYS_CALL Clone(IkxSysEnumStringList** copy) = 0;

  protected:
    ~IkxSysEnumStringList() = default;
};

struct IkxSysEnumPropertyTag : IUnknown {
    virtual HRESULT KXSYS_CALL Next(ULONG count, kxSysAttributeTagID* tags, ULONG* fetched) = 0;
    virtual HRESULT KXSYS_CALL Skip(ULONG count) = 0;
    virtual HRESULT KXSYS_CALL Reset() = 0;
    virtual HRESULT KXSYS_CALL Clone(IkxSysEnumPropertyTag** copy) = 0;

  protected:
    ~IkxSysEnumPropertyTag() = default;
};

// A map from attribute tag to one typed value, with the set of tags changed since the last
// ClearChangedTags. Getters fail with CORBEL_E_TAG_NOT_FOUND or CORBEL_E_TYPE_MISMATCH and
// never convert between types.
struct IkxSysPropertyBag : IUnknown {
    virtual HRESULT KXSYS_CALL EnumerateTags(IkxSysEnumPropertyTag** tags) = 0;          // 3
    virtual HRESULT KXSYS_CALL HasTag(kxSysAttributeTagID tag) = 0;                      // 4
    virtual HRESULT KXSYS_CALL GetTagType(kxSysAttributeTagID tag, ULONG* type) = 0;     // 5
    virtual HRESULT KXSYS_CALL RemoveTag(kxSysAttributeTagID tag) = 0;                   // 6
    virtual HRESULT KXSYS_CALL RemoveAllTags() = 0;                                      // 7
    virtual HRESULT KXSYS_CALL SetBool(kxSysAttributeTagID tag, BOOL value) = 0;         // 8
    virtual HRESULT KXSYS_CALL SetLong(kxSysAttributeTagID tag, LONG value) = 0;         // 9
    virtual HRESULT KXSYS_CALL SetULong(kxSysAttributeTagID tag, ULONG value) = 0;       // 10
    virtual HRESULT KXSYS_CALL SetDouble(kxSysAttributeTagID tag, double value) = 0;     // 11
    virtual HRESULT KXSYS_CALL SetGUID(kxSysAttributeTagID tag, const GUID* value) = 0;  // 12
    virtual HRESULT KXSYS_CALL SetString(kxSysAttributeTagID tag, const OLECHAR* value) = 0;
    // Six fields of local time: year, month (1 to 12), day, hour, minute, second.
    virtual HRESULT KXSYS_CALL SetDateTime(kxSysAttributeTagID tag, const LONG* fields) = 0;
    virtual HRESULT KXSYS_CALL GetBool(kxSysAttributeTagID tag, BOOL* value) = 0;      // 15
    virtual HRESULT KXSYS_CALL GetLong(kxSysAttributeTagID tag, LONG* value) = 0;      // 16
    virtual HRESULT KXSYS_CALL GetULong(kxSysAttributeTagID tag, ULONG* value) = 0;    // 17
    virtual HRESULT KXSYS_CALL GetDouble(kxSysAttributeTagID tag, double* value) = 0;  // 18
    virtual HRESULT KXSYS_CALL GetGUID(kxSysAttributeTagID tag, GUID* value) = 0;      // 19
    // A new BSTR that the caller frees; null on failure.
    virtual HRESULT KXSYS_CALL GetString(kxSysAttributeTagID tag, BSTR* value) = 0;  // 20
    // Six fields as for SetDateTime; all -1 for a time before 1904.
    virtual HRESULT KXSYS_CALL GetDateTime(kxSysAttributeTagID tag, LONG* fields) = 0;  // 21

  protected:
    ~IkxSysPropertyBag() = default;
};

struct IkxSysPropertyBag2 : IkxSysPropertyBag {
    // A new bag with a copy of every value; each copied tag is a changed tag there.
    virtual HRESULT KXSYS_CALL Clone(IkxSysPropertyBag2** copy) = 0;                    // 22
    virtual HRESULT KXSYS_CALL ClearChangedTags() = 0;                                  // 23
    virtual HRESULT KXSYS_CALL EnumerateChangedTags(IkxSysEnumPropertyTag** tags) = 0;  // 24
    virtual HRESULT KXSYS_CALL GetTimestamp(kxSysAttributeTagID tag,
                                            kxSysAttrTimestampUTC* value) = 0;  // 25
    virtual HRESULT KXSYS_CALL SetTimestamp(kxSysAttributeTagID tag,
                                            const kxSysAttrTimestampUTC* value) = 0;  // 26

  protected:
    ~IkxSysPropertyBag2() = default;
};

// The host's receiver of discovered items; the expert calls only AddItem.
struct IkxSysItemCollector : IUnknown {
    virtual HRESULT KXSYS_CALL ReservedCollector1() = 0;              // slot 3
    virtual HRESULT KXSYS_CALL ReservedCollector2() = 0;              // slot 4
    virtual HRESULT KXSYS_CALL AddItem(IkxSysPropertyBag* item) = 0;  // slot 5

  protected:
    ~IkxSysItemCollector() = default;
};

struct IkxSysExpertInfo : IUnknown {
    virtual HRESULT KXSYS_CALL GetExpertGUID(GUID* identifier) = 0;  // slot 3
    virtual HRESULT KXSYS_CALL GetDisplayName(BSTR* name) = 0;       // slot 4
    virtual HRESULT KXSYS_CALL GetVersionString(BSTR* version) = 0;  // slot 5
    virtual HRESULT KXSYS_CALL GetShortName(BSTR* name) = 0;         // slot 6

  protected:
    ~IkxSysExpertInfo() = default;
};

struct IkxSysExpert : IkxSysExpertInfo {
    virtual HRESULT KXSYS_CALL Initialize() = 0;                                            // 7
    virtual HRESULT KXSYS_CALL Shutdown() = 0;                                              // 8
    virtual HRESULT KXSYS_CALL EnumerateItems(IkxSysItemCollector* collector) = 0;          // 9
    virtual HRESULT KXSYS_CALL GetItemNames(IkxSysEnumStringList** names) = 0;              // 10
    virtual HRESULT KXSYS_CALL GetItem(const OLECHAR* name, IkxSysPropertyBag** item) = 0;  // 11
    // `reserved` is not read.
    virtual HRESULT KXSYS_CALL GetItemProperties(const OLECHAR* name, ULONG count,
                                                 const kxSysAttributeTagID* tags, void* reserved,
                                                 IkxSysPropertyBag** properties) = 0;  // 12

  protected:
    ~IkxSysExpert() = default;
};

struct IkxSysExpert2 : IkxSysExpert {
    virtual HRESULT KXSYS_CALL ReservedOperation1(void* reserved) = 0;  // 13: E_NOTIMPL
    virtual HRESULT KXSYS_CALL ReservedOperation2(void* reserved) = 0;  // 14: E_NOTIMPL
    // Checks every changed tag of `changes`; on success `accepted` lists the tags that will
    // be written; on CORBEL_E_INVALID_VALUE `message` holds the rejection sentences (a BSTR
    // the caller frees). `name` is not read.
    virtual HRESULT KXSYS_CALL ValidateChanges(const OLECHAR* name, IkxSysPropertyBag* changes,
                                               IkxSysEnumPropertyTag** accepted,
                                               BSTR* message) = 0;  // 15
    // Writes every changed tag to the clock in changed-tag order; stops at the first failure.
    // `result` is always set to 0.
    virtual HRESULT KXSYS_CALL ApplyChanges(const OLECHAR* name, IkxSysPropertyBag* changes,
                                            ULONG* result) = 0;  // 16

  protected:
    ~IkxSysExpert2() = default;
};

#if defined(_WIN32) && defined(__GNUC__)
#pragma GCC diagnostic pop
#endif

// The library's one export. The expert answers QueryInterface for IUnknown, IkxSysExpert and
// IkxSysExpert2 with this same pointer.
extern "C" HRESULT KXSYS_CALL createCorbelExpert(IkxSysExpert2** expert);
using createCorbelExpertFunction = HRESULT(KXSYS_CALL*)(IkxSysExpert2**);

#endif
