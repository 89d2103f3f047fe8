// SPDX-License-Identifier: MIT
// The sheet text: "all", ranges "start-end" and numbers, separated by commas.
#include <string_view>

#include "module/string_table.h"
#include "specification/specification.h"
#include "specification/tokenizer.h"

namespace {

std::string_view TrimBlanks(std::string_view text)
{
    const size_t first = text.find_first_not_of(' ');
    if (first == std::string_view::npos) return {};
    return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

bool IsAll(std::string_view item)
{
    if (item.size() != 3) return false;
    for (size_t i = 0; i < 3; ++i)
        if ((item[i] | 0x20) != "all"[i]) return false;
    return true;
}

// A list past the bound is refused before its sheets are read one by one.
bool Refuse(std::string *refusal)
{
    constexpr int kMessageTooManySheets = 155;
    if (refusal) *refusal = vantrel::FormatMessage(kMessageTooManySheets, int(CSpecification::kMaxSheetEntries));
    return false;
}

}  // namespace

bool CSpecification::GetSheetList(const std::string &spec, int sheetCount, std::vector<int32_t> &sheets,
                                  std::string *refusal) const
{
    std::string text;
    if (!GetKeyValue(spec, ExcelSheet, text)) {
        sheets.push_back(1);
        return true;
    }
    // An empty list means the first sheet, as the dialog's field promises.
    const std::string trimmed(TrimBlanks(text));
    if (trimmed.empty()) {
        sheets.push_back(1);
        return true;
    }
    if (trimmed.find(',') == std::string::npos) return ParseSheetItem(trimmed, sheetCount, sheets);
    return ParseSheetList(trimmed, sheetCount, sheets, refusal);
}

bool CSpecification::ParseSheetList(const std::string &text, int sheetCount, std::vector<int32_t> &sheets,
                                    std::string *refusal) const
{
    std::string_view rest = TrimBlanks(text);
    if (rest.empty()) {
        sheets.push_back(1);
        return true;
    }
    size_t comma;
    size_t items = 0;
    while ((comma = rest.find(',')) != std::string_view::npos) {
        if (++items > kMaxSheetEntries || sheets.size() > kMaxSheetEntries) return Refuse(refusal);
        const std::string piece(rest.substr(0, comma));
        rest.remove_prefix(comma + 1);
        if (IsAll(piece)) {
            AppendAllSheets(sheetCount, sheets);
        } else if (piece.find('-') != std::string::npos) {
            if (!AppendSheetRange(piece, sheetCount, sheets)) return false;
        } else if (!AppendSheetNumber(piece, sheetCount, sheets)) {
            return false;
        }
    }
    if (!ParseSheetItem(std::string(rest), sheetCount, sheets)) return false;
    return sheets.size() <= kMaxSheetEntries || Refuse(refusal);
}

std::string CSpecification::WithoutSheetList(const std::string &spec) const
{
    std::string name;
    GetKeyName(ExcelSheet, name);
    std::string kept;
    for (std::string_view piece : vantrel::SplitPieces(spec, ";")) {
        const auto tokens = vantrel::SplitPieces(piece, "=");
        kept.append(!tokens.empty() && tokens[0] == name ? std::string_view(name) : piece);
        kept.push_back(';');
    }
    return kept;
}

bool CSpecification::ParseSheetItem(const std::string &item, int sheetCount, std::vector<int32_t> &sheets) const
{
    if (IsAll(item)) return AppendAllSheets(sheetCount, sheets);
    if (item.find('-') != std::string::npos) return AppendSheetRange(item, sheetCount, sheets);
    return AppendSheetNumber(item, sheetCount, sheets);
}

bool CSpecification::AppendAllSheets(int sheetCount, std::vector<int32_t> &sheets) const
{
    for (int32_t sheet = 1; sheet <= sheetCount; ++sheet) sheets.push_back(sheet);
    return true;
}

bool CSpecification::AppendSheetRange(const std::string &item, int sheetCount, std::vector<int32_t> &sheets) const
{
    const size_t dash = item.find('-');
    const std::string_view whole(item);
    const int start = vantrel::LeadingInt(TrimBlanks(whole.substr(0, dash)));
    const int end = vantrel::LeadingInt(TrimBlanks(whole.substr(dash + 1)));
    if (start == 0) return false;
    if (end == 0 || end > sheetCount) return false;
    for (int32_t sheet = start; sheet <= end; ++sheet) sheets.push_back(sheet);
    return true;
}

bool CSpecification::AppendSheetNumber(const std::string &item, int sheetCount, std::vector<int32_t> &sheets) const
{
    const int number = vantrel::LeadingInt(item);
    if (number == 0 || number > sheetCount) return false;
    sheets.push_back(number);
    return true;
}
