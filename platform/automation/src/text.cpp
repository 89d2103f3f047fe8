// SPDX-License-Identifier: MIT
#include "automation/text.h"

#include <cstdint>
#include <new>

namespace automation {
namespace {

constexpr char32_t kReplacement = 0xFFFD;

bool IsHighSurrogate(char32_t c) { return c >= 0xD800 && c <= 0xDBFF; }
bool IsLowSurrogate(char32_t c) { return c >= 0xDC00 && c <= 0xDFFF; }
bool IsContinuation(unsigned char b) { return (b & 0xC0) == 0x80; }

// Decodes one code point at text[pos] and advances pos. An ill-formed
// sequence gives U+FFFD and is skipped by its longest valid beginning, so
// each broken sequence costs one replacement character.
char32_t DecodeUtf8(std::string_view text, size_t &pos)
{
    const auto lead = static_cast<unsigned char>(text[pos++]);
    if (lead < 0x80) return lead;
    int trail;
    char32_t cp;
    unsigned char low = 0x80, high = 0xBF;  // range of the first trail byte
    if (lead >= 0xC2 && lead <= 0xDF) {
        trail = 1;
        cp = lead & 0x1F;
    } else if (lead >= 0xE0 && lead <= 0xEF) {
        trail = 2;
        cp = lead & 0x0F;
        if (lead == 0xE0) low = 0xA0;   // no overlong forms
        if (lead == 0xED) high = 0x9F;  // no surrogates
    } else if (lead >= 0xF0 && lead <= 0xF4) {
        trail = 3;
        cp = lead & 0x07;
        if (lead == 0xF0) low = 0x90;
        if (lead == 0xF4) high = 0x8F;  // nothing past U+10FFFF
    } else {
        return kReplacement;
    }
    for (int i = 0; i < trail; ++i) {
        if (pos >= text.size()) return kReplacement;
        const auto b = static_cast<unsigned char>(text[pos]);
        if (i == 0 ? (b < low || b > high) : !IsContinuation(b)) return kReplacement;
        cp = (cp << 6) | (b & 0x3F);
        ++pos;
    }
    return cp;
}

}  // namespace

void AppendUtf8(std::string &out, char32_t cp)
{
    if (cp < 0x80) {
        out += static_cast<char>(cp);
    } else if (cp < 0x800) {
        out += static_cast<char>(0xC0 | (cp >> 6));
        out += static_cast<char>(0x80 | (cp & 0x3F));
    } else if (cp < 0x10000) {
        out += static_cast<char>(0xE0 | (cp >> 12));
        out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
        out += static_cast<char>(0x80 | (cp & 0x3F));
    } else {
        out += static_cast<char>(0xF0 | (cp >> 18));
        out += static_cast<char>(0x80 | ((cp >> 12) & 0x3F));
        out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
        out += static_cast<char>(0x80 | (cp & 0x3F));
    }
}

std::string MessageExcerpt(std::string_view text, size_t maxCharacters)
{
    static constexpr char kHex[] = "0123456789ABCDEF";
    const auto appendByte = [](std::string &out, unsigned char b) {
        out += "\\x";
        out += kHex[b >> 4];
        out += kHex[b & 0xF];
    };
    std::string out = "\"";
    size_t pos = 0;
    for (size_t characters = 0; pos < text.size() && characters < maxCharacters; ++characters) {
        const size_t start = pos;
        const char32_t cp = DecodeUtf8(text, pos);
        const std::string_view bytes = text.substr(start, pos - start);
        if (cp == kReplacement && bytes != "\xEF\xBF\xBD") {
            for (const char b : bytes) appendByte(out, static_cast<unsigned char>(b));
        } else if (cp == '"' || cp == '\\') {
            out += '\\';
            out += char(cp);
        } else if (cp == '\n') {
            out += "\\n";
        } else if (cp == '\t') {
            out += "\\t";
        } else if (cp == '\r') {
            out += "\\r";
        } else if (cp < 0x20 || cp == 0x7F) {
            appendByte(out, static_cast<unsigned char>(cp));
        } else {
            out += bytes;
        }
    }
    if (pos >= text.size()) return out + "\"";
    return out + "...\" (" + std::to_string(text.size()) + " bytes)";
}

std::u16string Utf8ToUtf16(std::string_view utf8)
{
    std::u16string out;
    out.reserve(utf8.size());
    size_t pos = 0;
    while (pos < utf8.size()) {
        const char32_t cp = DecodeUtf8(utf8, pos);
        if (cp >= 0x10000) {
            out += static_cast<char16_t>(0xD800 + ((cp - 0x10000) >> 10));
            out += static_cast<char16_t>(0xDC00 + ((cp - 0x10000) & 0x3FF));
        } else {
            out += static_cast<char16_t>(cp);
        }
    }
    return out;
}

std::string Utf16ToUtf8(std::u16string_view utf16)
{
    std::string out;
    out.reserve(utf16.size());
    for (size_t i = 0; i < utf16.size(); ++i) {
        char32_t cp = utf16[i];
        if (IsHighSurrogate(cp) && i + 1 < utf16.size() && IsLowSurrogate(utf16[i + 1])) {
            cp = 0x10000 + ((cp - 0xD800) << 10) + (utf16[i + 1] - 0xDC00);
            ++i;
        } else if (IsHighSurrogate(cp) || IsLowSurrogate(cp)) {
            cp = kReplacement;
        }
        AppendUtf8(out, cp);
    }
    return out;
}

std::string BstrToUtf8(BSTR bstr)
{
    if (!bstr) return {};
    return Utf16ToUtf8(std::u16string_view(bstr, SysStringLen(bstr)));
}

BSTR AllocBstr(std::string_view utf8)
{
    const std::u16string text = Utf8ToUtf16(utf8);
    if (text.size() > UINT32_MAX / sizeof(char16_t) / 2) throw std::bad_alloc();
    BSTR b = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
    if (!b) throw std::bad_alloc();
    return b;
}

}  // namespace automation
