// SPDX-License-Identifier: MIT
// The texts of a binary workbook as UTF-8: the strings of newer files in
// UTF-16 or Latin-1, those of older ones in the workbook's code page.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

namespace workbook::xls {

class PieceReader;

std::string Utf16ToUtf8(std::string_view littleEndianBytes);
std::string Latin1ToUtf8(std::string_view bytes);

// Bytes in a Windows or Mac code page (the CODEPAGE record's number) as UTF-8.
class CodePage {
public:
    explicit CodePage(uint16_t number = 1252);
    ~CodePage();
    CodePage(const CodePage &) = delete;
    CodePage &operator=(const CodePage &) = delete;

    std::string ToUtf8(std::string_view bytes) const;

private:
    void *converter_ = nullptr;  // an iconv_t
};

// A string with a flags byte after its length (cch, then grbit, rich text
// runs and phonetic data, which are passed over); lengthBytes is 1 or 2.
std::string ReadUnicodeString(PieceReader &in, int lengthBytes);
// A string of lengthBytes-long length and bytes in the code page.
std::string ReadByteString(PieceReader &in, int lengthBytes, const CodePage &codePage);

}  // namespace workbook::xls
