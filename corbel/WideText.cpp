#include "corbel/WideText.h"

namespace corbel {

namespace {

constexpr char32_t kReplacement = 0xFFFD;

// One code point from `text` at `at`, which moves past it.
char32_t nextFromUtf8(std::string_view text, std::size_t& at) {
    const auto lead = static_cast<unsigned char>(text[at++]);
    int more = 0;
    char32_t point = 0;
    if (lead < 0x80) {
        return lead;
    } else if ((lead & 0xE0) == 0xC0) {
        more = 1, point = lead & 0x1Fu;
    } else if ((lead & 0xF0) == 0xE0) {
        more = 2, point = lead & 0x0Fu;
    } else if ((lead & 0xF8) == 0xF0) {
        more = 3, point = lead & 0x07u;
    } else {
        return kReplacement;
    }
    for (int i = 0; i < more; ++i) {
        if (at >= text.size() || (static_cast<unsigned char>(text[at]) & 0xC0) != 0x80) {
            return kReplacement;
        }
        point = (point << 6) | (static_cast<unsigned char>(text[at++]) & 0x3Fu);
    }
    const bool overlong = (more == 1 && point < 0x80) || (more == 2 && point < 0x800) ||
                          (more == 3 && point < 0x10000);
    const bool surrogate = point >= 0xD800 && point <= 0xDFFF;
    return overlong || surrogate || point > 0x10FFFF ? kReplacement : point;
}

void appendUtf8(std::string& out, char32_t point) {
    auto unit = [&out](char32_t bits) { out.push_back(static_cast<char>(bits)); };
    if (point < 0x80) {
        unit(point);
    } else if (point < 0x800) {
        unit(0xC0 | (point >> 6)), unit(0x80 | (point & 0x3F));
    } else if (point < 0x10000) {
        unit(0xE0 | (point >> 12)), unit(0x80 | ((point >> 6) & 0x3F));
        unit(0x80 | (point & 0x3F));
    } else {
        unit(0xF0 | (point >> 18)), unit(0x80 | ((point >> 12) & 0x3F));
        unit(0x80 | ((point >> 6) & 0x3F)), unit(0x80 | (point & 0x3F));
    }
}

}  // namespace

std::basic_string<OLECHAR> toUtf16(std::string_view text) {
    std::basic_string<OLECHAR> wide;
    std::size_t at = 0;
    while (at < text.size()) {
        const char32_t point = nextFromUtf8(text, at);
        if (point < 0x10000) {
            wide.push_back(static_cast<OLECHAR>(point));
        } else {
            wide.push_back(static_cast<OLECHAR>(0xD800 + ((point - 0x10000) >> 10)));
            wide.push_back(static_cast<OLECHAR>(0xDC00 + ((point - 0x10000) & 0x3FF)));
        }
    }
    return wide;
}

std::string toUtf8(std::basic_string_view<OLECHAR> text) {
    std::string narrow;
    for (std::size_t at = 0; at < text.size(); ++at) {
        const OLECHAR unit = text[at];
        char32_t point = unit;
        if (unit >= 0xD800 && unit <= 0xDBFF && at + 1 < text.size() && text[at + 1] >= 0xDC00 &&
            text[at + 1] <= 0xDFFF) {
            point = 0x10000 + ((char32_t{unit} - 0xD800) << 10) + (char32_t{text[++at]} - 0xDC00);
        } else if (unit >= 0xD800 && unit <= 0xDFFF) {
            point = kReplacement;
        }
        appendUtf8(narrow, point);
    }
    return narrow;
}

BSTR* OwnedBstr::out() {
    SysFreeString(text_);
    text_ = nullptr;
    return &text_;
}

std::string OwnedBstr::utf8() const {
    return text_ == nullptr ? std::string() : toUtf8(text_);
}

}  // namespace corbel
