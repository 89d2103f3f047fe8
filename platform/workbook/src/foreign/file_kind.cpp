// SPDX-License-Identifier: MIT
#include "foreign/file_kind.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <fstream>
#include <string_view>

namespace workbook {
namespace {

std::string LowerExtension(const std::string &path)
{
    const size_t slash = path.find_last_of('/');
    const size_t dot = path.find_last_of('.');
    if (dot == std::string::npos || (slash != std::string::npos && dot < slash)) return std::string();
    std::string extension = path.substr(dot);
    std::transform(extension.begin(), extension.end(), extension.begin(),
                   [](unsigned char c) { return char(std::tolower(c)); });
    return extension;
}

}  // namespace

FileKind KindOfExtension(const std::string &path)
{
    const std::string extension = LowerExtension(path);
    if (extension == ".xlsx" || extension == ".xlsm" || extension == ".xltx" || extension == ".xltm" ||
        extension == ".ods" || extension == ".ots")
        return FileKind::Package;
    if (extension == ".xls" || extension == ".xlt") return FileKind::BinaryWorkbook;
    if (extension == ".csv" || extension == ".tsv" || extension == ".txt") return FileKind::DelimitedText;
    return FileKind::Unknown;
}

bool IsOpenDocumentName(const std::string &path)
{
    const std::string extension = LowerExtension(path);
    return extension == ".ods" || extension == ".ots";
}

bool IsMacroWorkbookName(const std::string &path)
{
    const std::string extension = LowerExtension(path);
    return extension == ".xlsm" || extension == ".xltm";
}

FileKind SniffFileKind(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::array<unsigned char, 8> head{};
    if (!file.read(reinterpret_cast<char *>(head.data()), head.size())) {
        // Too short for a package or a binary workbook: text, if its name says so.
        if (file.bad() || !file.is_open()) return FileKind::Unknown;
        return KindOfExtension(path) == FileKind::DelimitedText ? FileKind::DelimitedText : FileKind::Unknown;
    }
    constexpr std::array<unsigned char, 4> kZip{'P', 'K', 3, 4};
    constexpr std::array<unsigned char, 8> kCompoundFile{0xD0, 0xCF, 0x11, 0xE0, 0xA1, 0xB1, 0x1A, 0xE1};
    if (std::equal(kZip.begin(), kZip.end(), head.begin())) return FileKind::Package;
    if (head == kCompoundFile) return FileKind::BinaryWorkbook;
    // The oldest writers left the records of a binary workbook bare, without
    // the compound file around them: a BOF record (0x0009, 0x0209, 0x0409,
    // 0x0809) of a few bytes comes first.
    const bool bof = head[0] == 0x09 && (head[1] == 0 || head[1] == 2 || head[1] == 4 || head[1] == 8);
    if (bof && head[3] == 0 && head[2] >= 4 && head[2] <= 20) return FileKind::BinaryWorkbook;
    return KindOfExtension(path) == FileKind::DelimitedText ? FileKind::DelimitedText : FileKind::Unknown;
}

const char *KindName(FileKind kind)
{
    switch (kind) {
    case FileKind::Package: return "a zip package (.xlsx, .xlsm, .ods)";
    case FileKind::BinaryWorkbook: return "a binary workbook (.xls)";
    case FileKind::DelimitedText: return "delimited text (.csv, .tsv, .txt)";
    case FileKind::Unknown: break;
    }
    return "no workbook";
}

}  // namespace workbook
