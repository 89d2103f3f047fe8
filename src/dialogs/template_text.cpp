// SPDX-License-Identifier: MIT
#include "dialogs/template_text.h"

#include <cstdio>
#include <memory>

#include "datetime/date_time_util.h"
#include "dialogs/field_parsing.h"
#include "dialogs/save_dialog_fields.h"
#include "module/string_table.h"

namespace vantrel::dialogs {
namespace {

constexpr const char kHeader[] = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
constexpr const char kRootStart[] =
    "<MSExcelVantrelSpecification xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n";
constexpr const char kReplacement[] = "\xEF\xBF\xBD";  // U+FFFD

constexpr int kStringShortSchema = 101;
constexpr int kStringLongSchemaHead = 103;
constexpr int kStringLongSchemaTail = 104;

// The length of the well-formed UTF-8 sequence at text[at], or 0 when there
// is none (a stray byte, an overlong form, a surrogate, beyond U+10FFFF).
// code gets the character.
size_t Utf8SequenceAt(const std::string &text, size_t at, char32_t &code)
{
    const auto byte = [&](size_t i) { return static_cast<unsigned char>(text[i]); };
    const unsigned char first = byte(at);
    size_t length = 0;
    char32_t minimum = 0;
    if (first < 0x80) {
        code = first;
        return 1;
    } else if (first >= 0xC2 && first <= 0xDF) {
        length = 2, code = first & 0x1F, minimum = 0x80;
    } else if (first >= 0xE0 && first <= 0xEF) {
        length = 3, code = first & 0x0F, minimum = 0x800;
    } else if (first >= 0xF0 && first <= 0xF4) {
        length = 4, code = first & 0x07, minimum = 0x10000;
    } else {
        return 0;
    }
    if (at + length > text.size()) return 0;
    for (size_t i = 1; i < length; ++i) {
        if ((byte(at + i) & 0xC0) != 0x80) return 0;
        code = (code << 6) | (byte(at + i) & 0x3F);
    }
    if (code < minimum || code > 0x10FFFF || (code >= 0xD800 && code <= 0xDFFF)) return 0;
    return length;
}

// Characters that an XML 1.0 document can hold at all.
bool IsXmlCharacter(char32_t code)
{
    if (code < 0x20) return code == 0x09 || code == 0x0A || code == 0x0D;
    return code != 0xFFFE && code != 0xFFFF;
}

}  // namespace

std::string EscapeAttributeValue(const std::string &value)
{
    std::string escaped;
    escaped.reserve(value.size());
    for (size_t at = 0; at < value.size();) {
        char32_t code = 0;
        const size_t length = Utf8SequenceAt(value, at, code);
        if (length == 0 || !IsXmlCharacter(code)) {
            escaped += kReplacement;
            at += length == 0 ? 1 : length;
            continue;
        }
        switch (code) {
        case '&': escaped += "&amp;"; break;
        case '<': escaped += "&lt;"; break;
        case '>': escaped += "&gt;"; break;
        case '"': escaped += "&quot;"; break;
        // White space other than a blank would become a blank when read.
        case '\t': escaped += "&#9;"; break;
        case '\n': escaped += "&#10;"; break;
        case '\r': escaped += "&#13;"; break;
        default: escaped.append(value, at, length);
        }
        at += length;
    }
    return escaped;
}

std::string ComposeTemplateText(const std::vector<TemplateAttribute> &attributes)
{
    std::string text = kHeader;
    text += kRootStart;
    for (const auto &[name, value] : attributes) {
        text += name;
        text += "=\"";
        text += EscapeAttributeValue(value);
        text += "\" ";
    }
    text += "/>";
    return text;
}

std::string FlagText(int flag) { return flag == 1 ? "true" : "false"; }

std::string OpenTemplateFormat(const std::string &format)
{
    if (format.empty() || format.front() != '"') return format;
    const auto first = format.find_first_not_of('"');
    const auto last = format.find_last_not_of('"');
    const std::string inner = first == std::string::npos ? std::string() : format.substr(first, last - first + 1);
    return '\'' + inner + '\'';
}

std::vector<TemplateAttribute> OpenTemplateAttributes(const OpenDialogFields &dialog, const TimePageFields &time,
                                                      const DataPageFields &data)
{
    const auto number = [](int value) { return std::to_string(value); };
    return {
        {"ExcelSheet", dialog.m_excelSheets},
        {"DataTimeType", number(time.m_timeMode)},
        {"DateTimeCol", number(time.m_dateTimeCol)},
        {"UseDTFormat", FlagText(time.m_useDTFormat)},
        {"DateTimeFormat", OpenTemplateFormat(time.m_dateTimeFormat)},
        {"GlobalDate", CDateTimeUtil::FormatDate(time.m_globalDate, "%Y-%m-%d")},
        {"TimeCol", number(time.m_timeCol)},
        {"UseTFormat", FlagText(time.m_useTFormat)},
        {"GlobalTime", CDateTimeUtil::FormatDate(time.m_globalTime, "%H:%M:%S")},
        {"TimeFormat", OpenTemplateFormat(time.m_timeFormat)},
        {"DateCol", number(time.m_dateCol)},
        {"UseDFormat", FlagText(time.m_useDFormat)},
        {"DateFormat", OpenTemplateFormat(time.m_dateFormat)},
        {"UseUnitTypeRow", FlagText(data.m_itemTypeInRow)},
        {"GlobalUnitType", data.m_itemType},
        {"UnitTypeRow", number(data.m_itemTypeRow)},
        {"UseUnitRow", FlagText(data.m_unitInRow)},
        {"GlobalUnit", data.m_unit},
        {"UnitRow", number(data.m_unitRow)},
        {"UseValueTypeRow", FlagText(data.m_valueTypeInRow)},
        {"GlobalValueType", data.m_valueType},
        {"ValueTypeRow", number(data.m_valueTypeRow)},
        {"ItemDescriptionRow", number(data.m_itemDescriptionRow)},
        {"StartRow", number(data.m_startRow)},
        {"UseDelValNotEmpty", FlagText(data.m_useDelValNotEmpty)},
        {"UseDeleteValueRow", FlagText(data.m_deleteValueInRow)},
        // Every digit that reading it back needs, with a decimal point.
        {"DeleteValue", NumberText(data.m_deleteValue)},
        {"DeleteValueRow", number(data.m_deleteValueRow)},
    };
}

std::vector<TemplateAttribute> SaveTemplateAttributes(const SaveDialogFields &fields)
{
    const auto number = [](int value) { return std::to_string(value); };
    return {
        {"DateTimeCol", number(fields.m_dateTimeColumn)},
        {"UseDTFormat", FlagText(fields.m_multiColumns)},
        {"DateTimeFormat", fields.m_format},
        {"UnitTypeRow", number(fields.m_unitTypeRow)},
        {"UnitRow", number(fields.m_saveUnitRow)},
        {"ValueTypeRow", number(fields.m_saveValueTypeRow)},
        {"ItemDescriptionRow", number(fields.m_saveItemDescriptionRow)},
        {"StartRow", number(fields.m_dataStartRow)},
        {"UseDelValNotEmpty", FlagText(fields.m_useDeleteRow)},
        {"DeleteValueRow", number(fields.m_saveDeleteValueRow)},
    };
}

bool WriteTemplateText(const std::string &path, const std::string &text)
{
    std::unique_ptr<FILE, int (*)(FILE *)> file(std::fopen(path.c_str(), "wb"), &std::fclose);
    if (!file) return false;
    const bool written = std::fwrite(text.data(), 1, text.size(), file.get()) == text.size();
    return std::fclose(file.release()) == 0 && written;
}

std::string ShortTemplateSchema() { return LoadMessage(kStringShortSchema); }

std::string LongTemplateSchema() { return LoadMessage(kStringLongSchemaHead) + LoadMessage(kStringLongSchemaTail); }

}  // namespace vantrel::dialogs
