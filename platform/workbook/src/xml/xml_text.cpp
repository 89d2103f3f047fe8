// SPDX-License-Identifier: MIT
#include "xml/xml_text.h"

#include "workbook/cell_text.h"

#include <cstdio>

namespace workbook::xml {
namespace {

int HexDigit(char c)
{
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}

// The value of an escape _xHHHH_ starting at text[i], or -1.
long EscapeAt(std::string_view text, size_t i)
{
    if (i + 7 > text.size() || text[i] != '_' || text[i + 1] != 'x' || text[i + 6] != '_') return -1;
    long v = 0;
    for (size_t k = i + 2; k < i + 6; ++k) {
        int d = HexDigit(text[k]);
        if (d < 0) return -1;
        v = v * 16 + d;
    }
    return v;
}

void AppendEscape(std::string &out, unsigned v)
{
    char buf[8];
    std::snprintf(buf, sizeof buf, "_x%04X_", v & 0xFFFFu);
    out += buf;
}

// Whether text[i] is written as an _xHHHH_ escape: a character XML 1.0
// can't hold, or the "_" of a literal that would read as an escape.
bool WrittenAsEscape(std::string_view text, size_t i)
{
    const auto c = static_cast<unsigned char>(text[i]);
    return (c < 0x20 && c != '\t' && c != '\n') || (c == '_' && EscapeAt(text, i) >= 0);
}

}  // namespace

void AppendEscaped(std::string &out, std::string_view text)
{
    for (char c : text) {
        switch (c) {
        case '&': out += "&amp;"; break;
        case '<': out += "&lt;"; break;
        case '>': out += "&gt;"; break;
        case '"': out += "&quot;"; break;
        default: out += c;
        }
    }
}

void AppendCellText(std::string &out, std::string_view text)
{
    for (size_t i = 0; i < text.size(); ++i) {
        auto c = static_cast<unsigned char>(text[i]);
        if (WrittenAsEscape(text, i)) {
            AppendEscape(out, c);
            continue;
        }
        switch (c) {
        case '&': out += "&amp;"; break;
        case '<': out += "&lt;"; break;
        case '>': out += "&gt;"; break;
        default: out += static_cast<char>(c);
        }
    }
}

void DecodeCellEscapes(std::string &text)
{
    if (text.find("_x") == std::string::npos) return;
    std::string out;
    out.reserve(text.size());
    for (size_t i = 0; i < text.size();) {
        long v = EscapeAt(text, i);
        if (v < 0) {
            out += text[i++];
            continue;
        }
        i += 7;
        char32_t cp = static_cast<char32_t>(v);
        if (cp >= 0xD800 && cp < 0xDC00) {
            long low = EscapeAt(text, i);
            if (low >= 0xDC00 && low < 0xE000) {
                cp = 0x10000 + ((cp - 0xD800) << 10) + (static_cast<char32_t>(low) - 0xDC00);
                i += 7;
            } else {
                cp = 0xFFFD;
            }
        } else if (cp >= 0xDC00 && cp < 0xE000) {
            cp = 0xFFFD;
        }
        AppendUtf8(out, cp);
    }
    text.swap(out);
}

}  // namespace workbook::xml

namespace workbook {

size_t StoredCellTextBytes(std::string_view text)
{
    // The reader counts the text with its entities resolved and its escapes not.
    size_t bytes = text.size();
    for (size_t i = 0; i < text.size(); ++i)
        if (xml::WrittenAsEscape(text, i)) bytes += 6;
    return bytes;
}

}  // namespace workbook
