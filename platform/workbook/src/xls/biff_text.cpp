// SPDX-License-Identifier: MIT
#include "xls/biff_text.h"

#include <iconv.h>

#include <algorithm>
#include <cerrno>

#include "xls/biff_records.h"
#include "xls/little_endian.h"

namespace workbook::xls {
namespace {

void AppendUtf8(std::string &out, uint32_t code)
{
    if (code < 0x80) {
        out += char(code);
    } else if (code < 0x800) {
        out += char(0xC0 | code >> 6);
        out += char(0x80 | (code & 0x3F));
    } else if (code < 0x10000) {
        out += char(0xE0 | code >> 12);
        out += char(0x80 | ((code >> 6) & 0x3F));
        out += char(0x80 | (code & 0x3F));
    } else {
        out += char(0xF0 | code >> 18);
        out += char(0x80 | ((code >> 12) & 0x3F));
        out += char(0x80 | ((code >> 6) & 0x3F));
        out += char(0x80 | (code & 0x3F));
    }
}

constexpr uint32_t kReplacement = 0xFFFD;

std::string IconvName(uint16_t number)
{
    switch (number) {
    case 367: return "ASCII";
    case 10000: case 32768: return "MACINTOSH";
    case 32769: return "CP1252";
    default: return "CP" + std::to_string(number);
    }
}

}  // namespace

std::string Utf16ToUtf8(std::string_view bytes)
{
    std::string out;
    out.reserve(bytes.size());
    for (size_t i = 0; i + 1 < bytes.size(); i += 2) {
        uint32_t code = U16(bytes, i);
        if (code >= 0xD800 && code < 0xDC00 && i + 3 < bytes.size()) {
            const uint32_t low = U16(bytes, i + 2);
            if (low >= 0xDC00 && low < 0xE000) {
                code = 0x10000 + ((code - 0xD800) << 10) + (low - 0xDC00);
                i += 2;
            }
        }
        AppendUtf8(out, code >= 0xD800 && code < 0xE000 ? kReplacement : code);  // a lone half
    }
    return out;
}

std::string Latin1ToUtf8(std::string_view bytes)
{
    std::string out;
    out.reserve(bytes.size());
    for (unsigned char c : bytes) AppendUtf8(out, c);
    return out;
}

CodePage::CodePage(uint16_t number)
{
    iconv_t converter = iconv_open("UTF-8", IconvName(number).c_str());
    if (converter == iconv_t(-1)) converter = iconv_open("UTF-8", "CP1252");  // an unknown page: the usual one
    if (converter != iconv_t(-1)) converter_ = converter;
}

CodePage::~CodePage()
{
    if (converter_) iconv_close(iconv_t(converter_));
}

std::string CodePage::ToUtf8(std::string_view bytes) const
{
    if (!converter_) return Latin1ToUtf8(bytes);
    iconv(iconv_t(converter_), nullptr, nullptr, nullptr, nullptr);
    std::string out(bytes.size() * 4 + 4, '\0');
    char *in = const_cast<char *>(bytes.data());
    size_t inLeft = bytes.size();
    char *to = out.data();
    size_t toLeft = out.size();
    while (inLeft > 0) {
        if (iconv(iconv_t(converter_), &in, &inLeft, &to, &toLeft) != size_t(-1)) break;
        if (errno == E2BIG) break;  // cannot happen: four bytes a byte is room enough
        // A byte the page doesn't have: the replacement character, and on.
        std::string replacement;
        AppendUtf8(replacement, kReplacement);
        if (toLeft < replacement.size()) break;
        to = std::copy(replacement.begin(), replacement.end(), to);
        toLeft -= replacement.size();
        ++in;
        --inLeft;
    }
    out.resize(out.size() - toLeft);
    return out;
}

std::string ReadUnicodeString(PieceReader &in, int lengthBytes)
{
    const uint32_t count = lengthBytes == 1 ? in.Byte() : in.U16();
    const uint8_t flags = in.Byte();
    const uint16_t runs = (flags & 0x08) ? in.U16() : 0;
    const uint32_t phonetic = (flags & 0x04) ? in.U32() : 0;
    std::string text = in.Characters(count, (flags & 0x01) != 0);
    in.Skip(uint64_t{runs} * 4 + phonetic);
    return text;
}

std::string ReadByteString(PieceReader &in, int lengthBytes, const CodePage &codePage)
{
    const uint32_t count = lengthBytes == 1 ? in.Byte() : in.U16();
    std::string bytes;
    for (uint32_t i = 0; i < count && !in.AtEnd(); ++i) bytes += char(in.Byte());
    return codePage.ToUtf8(bytes);
}

}  // namespace workbook::xls
