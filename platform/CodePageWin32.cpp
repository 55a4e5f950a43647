#include <windows.h>

#include <climits>

#include "platform/CodePage.h"
#include "platform/InvalidLocale.h"
#include "platform/OleText.h"
#include "platform/WinError.h"

namespace qv::dsc {

// Windows backend: the system's code page conversions. Code page 0 is the system's ANSI
// code page (CP_ACP).

namespace {

int countOf(std::size_t size, const char* source, std::uint32_t line) {
    if (size > static_cast<std::size_t>(INT_MAX)) {
        throw osdep::WinError(ERROR_INVALID_PARAMETER, source, line);
    }
    return static_cast<int>(size);
}

constexpr char16_t kReplacement = 0xFFFD;  // in no ANSI code page: it becomes '?'

bool isHighSurrogate(char16_t unit) {
    return unit >= 0xD800 && unit <= 0xDBFF;
}
bool isLowSurrogate(char16_t unit) {
    return unit >= 0xDC00 && unit <= 0xDFFF;
}

// The text checked and prepared for a code page. A lone surrogate throws: most code pages
// would silently make it '?'. Outside UTF-8 a character beyond the basic plane is one
// character that the set lacks, so its pair becomes one replacement, and so one '?'.
std::u16string preparedText(std::u16string_view text, UINT codePage) {
    const bool keepPairs = codePage == CP_UTF8 || (codePage == CP_ACP && GetACP() == CP_UTF8);
    std::u16string prepared;
    prepared.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char16_t unit = text[i];
        if (isLowSurrogate(unit) ||
            (isHighSurrogate(unit) && (i + 1 == text.size() || !isLowSurrogate(text[i + 1])))) {
            throw osdep::WinError(ERROR_NO_UNICODE_TRANSLATION, "WideToAnsi", 177);
        }
        if (!isHighSurrogate(unit)) {
            prepared.push_back(unit);
        } else if (keepPairs) {
            prepared.append(text.substr(i, 2));
            ++i;
        } else {
            prepared.push_back(kReplacement);
            ++i;
        }
    }
    return prepared;
}

constexpr std::size_t kLongestCharacter = 4;  // octets, in UTF-8; two in the double-byte sets

// Converts all of `text` or nothing: false when some octets are not valid in the set.
// ASCII is checked here, as the system would only strip the eighth bit.
bool appendStrict(std::u16string& out, std::string_view text, UINT codePage) {
    if (codePage == CodePage::kUsAscii) {
        for (const char c : text) {
            if (static_cast<unsigned char>(c) > 0x7F) {
                return false;
            }
        }
    }
    const int count = countOf(text.size(), "AnsiToWide", 149);
    const int size =
        MultiByteToWideChar(codePage, MB_ERR_INVALID_CHARS, text.data(), count, nullptr, 0);
    if (size <= 0) {
        return false;
    }
    std::wstring converted(static_cast<std::size_t>(size), L'\0');
    if (MultiByteToWideChar(codePage, MB_ERR_INVALID_CHARS, text.data(), count, converted.data(),
                            size) != size) {
        return false;
    }
    out += OleText::toLibrary(converted.data(), converted.size());
    return true;
}

}  // namespace

std::uint32_t CodePage::idOf(std::string_view localeName) {
    if (localeName.empty()) {
        return kCurrentLocale;
    }
    if (localeName == "US-ASCII") {
        return kUsAscii;
    }
    if (localeName == "cp932") {
        return kJapanese;
    }
    if (localeName == "UTF-8") {
        return kUtf8;
    }
    throw exception::InvalidLocale("_GetCodePageID", 58);
}

std::string CodePage::wideToAnsi(std::u16string_view text, std::string_view localeName) {
    const UINT codePage = idOf(localeName);
    std::string result;
    if (text.empty()) {
        return result;
    }
    const std::wstring prepared = OleText::toBoundary(preparedText(text, codePage));
    const int count = countOf(prepared.size(), "WideToAnsi", 167);
    // No best fit: a character the set lacks becomes '?', never a look-alike.
    const DWORD flags = codePage == CP_UTF8 ? 0 : WC_NO_BEST_FIT_CHARS;
    const int size =
        WideCharToMultiByte(codePage, flags, prepared.data(), count, nullptr, 0, nullptr, nullptr);
    if (size <= 0) {
        throw osdep::WinError("WideToAnsi", 167);
    }
    result.resize(static_cast<std::size_t>(size));
    if (WideCharToMultiByte(codePage, flags, prepared.data(), count, result.data(), size, nullptr,
                            nullptr) != size) {
        throw osdep::WinError("WideToAnsi", 177);
    }
    return result;
}

std::u16string CodePage::ansiToWide(std::string_view text, std::string_view localeName,
                                    tInvalidText invalid) {
    const UINT codePage = idOf(localeName);
    std::u16string result;
    if (text.empty()) {
        return result;
    }
    const int count = countOf(text.size(), "AnsiToWide", 149);
    if (appendStrict(result, text, codePage)) {
        return result;
    }
    if (invalid == tInvalidText::kThrow) {
        throw osdep::WinError(ERROR_NO_UNICODE_TRANSLATION, "AnsiToWide", 159);
    }
    // Character by character: the shortest run of octets that converts is one character;
    // an octet that begins none becomes U+FFFD and is skipped alone.
    result.clear();
    for (std::size_t at = 0; at < static_cast<std::size_t>(count);) {
        std::size_t octets = 1;
        while (octets <= kLongestCharacter && at + octets <= text.size() &&
               !appendStrict(result, text.substr(at, octets), codePage)) {
            ++octets;
        }
        if (octets > kLongestCharacter || at + octets > text.size()) {
            result.push_back(kReplacement);
            octets = 1;
        }
        at += octets;
    }
    return result;
}

}  // namespace qv::dsc
