// SPDX-License-Identifier: MIT
#include "csv/delimited_text_reader.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <string_view>
#include <vector>

#include "csv/delimited_parser.h"
#include "csv/separator_guess.h"
#include "csv/utf8_checker.h"
#include "errors.h"
#include "styles/format_bridge.h"
#include "workbook/limits.h"

namespace workbook::csv {
namespace {

constexpr size_t kChunkBytes = 64 * 1024;
// A sheet name holds at most 31 characters, none of these.
constexpr size_t kMaxSheetNameCharacters = 31;
constexpr std::string_view kNotInSheetNames = "[]:*?/\\";

// The file's name without folder and extension, made a sheet name; an empty
// name (the book then numbers the sheet) when it is no UTF-8.
std::string SheetName(const std::string &path)
{
    std::string name = path.substr(path.find_last_of('/') + 1);
    if (const size_t dot = name.find_last_of('.'); dot != std::string::npos && dot > 0) name.resize(dot);
    Utf8Checker checker;
    std::string kept;
    size_t characters = 0;
    for (const char c : name) {
        const auto byte = static_cast<unsigned char>(c);
        if (!checker.Accept(byte) || byte < 0x20) return {};
        const bool starts = byte < 0x80 || byte >= 0xC0;
        if (starts && ++characters > kMaxSheetNameCharacters) break;
        kept += kNotInSheetNames.find(c) == std::string_view::npos ? c : '_';
    }
    // A character cut off at the 32nd needs no finishing: the cut is before it.
    return checker.InCharacter() && characters <= kMaxSheetNameCharacters ? std::string() : kept;
}

// The encodings whose byte-order mark tells them, longest mark first.
struct ByteOrderMark {
    std::string_view bytes;
    const char *encoding;
};
constexpr ByteOrderMark kOtherEncodings[] = {{{"\xFF\xFE\0\0", 4}, "UTF-32"},
                                              {{"\0\0\xFE\xFF", 4}, "UTF-32"},
                                              {"\xFF\xFE", "UTF-16"},
                                              {"\xFE\xFF", "UTF-16"}};

// The start of the text after a UTF-8 byte-order mark; refuses the marks of
// other encodings.
std::string_view SkipByteOrderMark(std::string_view head)
{
    if (head.starts_with("\xEF\xBB\xBF")) return head.substr(3);
    for (const ByteOrderMark &mark : kOtherEncodings)
        if (head.starts_with(mark.bytes))
            Fail(kBadFile, std::string("line 1 begins with the byte-order mark of ") + mark.encoding + ": the text is " +
                               mark.encoding + ", not UTF-8: save the file as UTF-8");
    return head;
}

size_t ReadChunk(std::ifstream &file, std::vector<char> &buffer)
{
    file.read(buffer.data(), std::streamsize(buffer.size()));
    if (file.bad()) Fail(kBadFile, "the file could not be read to its end");
    return size_t(file.gcount());
}

}  // namespace

void ReadDelimitedText(const std::string &path, ConvertedBook &book)
{
    // A device or a pipe may never end: only a regular file is read.
    std::error_code ignored;
    if (!std::filesystem::is_regular_file(path, ignored)) Fail(kBadFile, "it is no regular file");
    std::ifstream file(path, std::ios::binary);
    if (!file) Fail(kBadFile, "the file could not be opened");
    std::vector<char> buffer(std::max(kChunkBytes, kSeparatorSampleBytes));
    const size_t headSize = ReadChunk(file, buffer);
    const std::string_view head = SkipByteOrderMark(std::string_view(buffer.data(), headSize));

    book.AddSheet(SheetName(path));
    DelimitedParser parser(GuessSeparator(head, file.eof()), [&](const Field &field) {
        if (field.text.empty()) return;
        if (field.row > limits::kMaxRows)
            Fail(kBadFile, "line " + std::to_string(field.line) + " holds record " + std::to_string(field.row) +
                               ", beyond the last row of a sheet (1048576)");
        if (field.column > limits::kMaxColumns)
            Fail(kBadFile, "line " + std::to_string(field.line) + " has more than 16384 fields, more than a sheet has columns");
        const format_bridge::TypedEntry entry = format_bridge::ReadTyped(field.text, false);
        book.Put(uint32_t(field.row), uint32_t(field.column), entry.value, entry.numberFormat);
    });
    parser.Feed(head);
    while (!file.eof()) parser.Feed(std::string_view(buffer.data(), ReadChunk(file, buffer)));
    parser.Finish();
}

}  // namespace workbook::csv
