#include "platform/CodePage.h"

#include <iconv.h>
#include <langinfo.h>

#include <bit>
#include <cerrno>
#include <cstring>

#include "platform/InvalidLocale.h"
#include "platform/WinError.h"

namespace qv::dsc {

namespace {

static_assert(std::endian::native == std::endian::little, "wide text is UTF-16LE here");
constexpr const char* kWideSet = "UTF-16LE";

const char* charsetOf(std::uint32_t codePage) {
    switch (codePage) {
        case CodePage::kUsAscii:
            return "US-ASCII";
        case CodePage::kJapanese:
            return "CP932";
        case CodePage::kUtf8:
            return "UTF-8";
        default:
            return nl_langinfo(CODESET);
    }
}

// One conversion descriptor, closed on every path out.
class tConverter {
  public:
    tConverter(const char* to, const char* from, const char* source, std::uint32_t line)
        : handle_(iconv_open(to, from)) {
        if (handle_ == reinterpret_cast<iconv_t>(-1)) {
            throw osdep::WinError(source, line);
        }
    }
    ~tConverter() { iconv_close(handle_); }
    tConverter(const tConverter&) = delete;
    tConverter& operator=(const tConverter&) = delete;

    // Converts all of [in, in + inSize) and appends to `out`. `onInvalid` is called with
    // the unconvertible input; it appends a replacement and answers how many octets to
    // skip, or throws.
    template <typename Output, typename OnInvalid>
    void run(const char* in, std::size_t inSize, Output& out, OnInvalid onInvalid) {
        char* input = const_cast<char*>(in);
        std::size_t left = inSize;
        char chunk[512];
        while (left > 0) {
            char* output = chunk;
            std::size_t room = sizeof(chunk);
            const std::size_t result = iconv(handle_, &input, &left, &output, &room);
            const int error = errno;
            append(out, chunk, static_cast<std::size_t>(output - chunk));
            if (result != static_cast<std::size_t>(-1) || error == E2BIG) {
                continue;
            }
            const std::size_t skip = onInvalid(input, left, error, out);
            input += skip;
            left -= skip;
        }
    }

  private:
    template <typename Output>
    static void append(Output& out, const char* octets, std::size_t count) {
        using Char = typename Output::value_type;
        const auto* first = reinterpret_cast<const Char*>(octets);
        out.append(first, count / sizeof(Char));
    }

    iconv_t handle_;
};

bool isHighSurrogate(char16_t unit) {
    return unit >= 0xD800 && unit <= 0xDBFF;
}
bool isLowSurrogate(char16_t unit) {
    return unit >= 0xDC00 && unit <= 0xDFFF;
}

// Octets of the one valid UTF-16 character at `at`, or 0 when it is not valid.
std::size_t characterOctets(const char* at, std::size_t left) {
    if (left < 2) {
        return 0;
    }
    char16_t first = 0;
    std::memcpy(&first, at, 2);
    if (isLowSurrogate(first)) {
        return 0;
    }
    if (!isHighSurrogate(first)) {
        return 2;
    }
    char16_t second = 0;
    if (left < 4) {
        return 0;
    }
    std::memcpy(&second, at + 2, 2);
    return isLowSurrogate(second) ? 4 : 0;
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
    const char* charset = charsetOf(idOf(localeName));
    std::string result;
    if (text.empty()) {
        return result;
    }
    tConverter converter(charset, kWideSet, "WideToAnsi", 167);
    converter.run(reinterpret_cast<const char*>(text.data()), text.size() * 2, result,
                  [](const char* at, std::size_t left, int error, std::string& out) {
                      const std::size_t octets = characterOctets(at, left);
                      if (error != EILSEQ || octets == 0) {
                          throw osdep::WinError(EILSEQ, "WideToAnsi", 177);
                      }
                      out.push_back('?');
                      return octets;
                  });
    return result;
}

std::u16string CodePage::ansiToWide(std::string_view text, std::string_view localeName,
                                    tInvalidText invalid) {
    const char* charset = charsetOf(idOf(localeName));
    std::u16string result;
    if (text.empty()) {
        return result;
    }
    tConverter converter(kWideSet, charset, "AnsiToWide", 149);
    converter.run(text.data(), text.size(), result,
                  [invalid](const char*, std::size_t left, int error, std::u16string& out) {
                      if (invalid == tInvalidText::kThrow) {
                          throw osdep::WinError(EILSEQ, "AnsiToWide", 159);
                      }
                      out.push_back(u'\uFFFD');
                      // A sequence cut short by the end is one character; otherwise the
                      // octet that cannot begin a character is skipped alone.
                      return error == EINVAL ? left : std::size_t{1};
                  });
    return result;
}

}  // namespace qv::dsc
