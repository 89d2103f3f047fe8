// SPDX-License-Identifier: MIT
#include "series_input.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>
#include <limits>
#include <iostream>
#include <iterator>
#include <stdexcept>
#include <string_view>

#include <nlohmann/json.hpp>

#include "automation/text.h"
#include "automation/values.h"
#include "bridge/value_type_names.h"
#include "hostseries/memory_series.h"
#include "specification/bounded_file.h"
#include "units/kvt.h"

namespace vantrel_cli {

namespace {

[[noreturn]] void Fail(const std::string &what) { throw std::runtime_error(what); }

// A piece of the series as a message quotes it: short, and escaped.
std::string Quoted(std::string_view text) { return automation::MessageExcerpt(text); }

// The most a series read from standard input may hold: a hundred times the
// text of a million steps of ten items, far beyond any real series.
constexpr size_t kMaxSeriesStdinBytes = size_t(1) << 30;

std::string LineText(size_t line) { return "series line " + std::to_string(line) + ": "; }

// One CSV record into fields (reused from record to record, so that a long
// series makes no allocation a field): split at the separator, a quoted field
// may hold separators, doubled quotes and line ends. pos moves past the
// record's line end.
void NextRecord(const std::string &text, size_t &pos, size_t &line, char separator, std::vector<std::string> &fields)
{
    size_t count = 1;
    fields.resize(1);
    fields[0].clear();
    const auto nextField = [&] {
        if (count == fields.size()) fields.emplace_back();
        fields[count++].clear();
    };
    bool quoted = false;
    const size_t startLine = line;
    while (pos < text.size()) {
        std::string &field = fields[count - 1];
        if (!quoted && field.empty() && text[pos] != '"') {
            // An unquoted field runs to the separator or the line end in one piece.
            size_t stop = pos;
            while (stop < text.size() && text[stop] != separator && text[stop] != '\n') ++stop;
            field.assign(text, pos, stop - pos);
            pos = stop;
            if (pos == text.size()) break;
        }
        const char c = text[pos++];
        if (quoted) {
            if (c == '"' && pos < text.size() && text[pos] == '"') {
                field += '"';
                ++pos;
            } else if (c == '"') {
                quoted = false;
            } else {
                if (c == '\n') ++line;
                field += c;
            }
        } else if (c == '"' && field.empty()) {
            quoted = true;
        } else if (c == separator) {
            nextField();
        } else if (c == '\n') {
            ++line;
            if (!field.empty() && field.back() == '\r') field.pop_back();
            fields.resize(count);
            return;
        } else {
            field += c;
        }
    }
    if (quoted) Fail(LineText(startLine) + "a quoted field is not closed");
    ++line;
    fields.resize(count);
    if (!fields.back().empty() && fields.back().back() == '\r') fields.back().pop_back();
}

double ParseNumber(const std::string &text, const std::string &where)
{
    double value = 0;
    const char *end = text.data() + text.size();
    const auto [ptr, error] = std::from_chars(text.data(), end, value);
    if (text.empty() || error != std::errc() || ptr != end) {
        // A decimal comma is the habit where the semicolon separates fields.
        const bool decimalComma = text.find(',') != std::string::npos;
        Fail(where + Quoted(text) + " is no number" + (decimalComma ? "; write the decimal separator as a point" : ""));
    }
    if (!std::isfinite(value)) Fail(where + Quoted(text) + " is no finite number");
    return value;
}

bool EqualsIgnoringCase(std::string_view a, std::string_view b)
{
    return std::ranges::equal(a, b, [](char x, char y) {
        return std::tolower(static_cast<unsigned char>(x)) == std::tolower(static_cast<unsigned char>(y));
    });
}

// What spreadsheet programs, R and pandas write for a value that is missing.
bool IsMissing(const std::string &field)
{
    return field.empty() || EqualsIgnoringCase(field, "NA") || EqualsIgnoringCase(field, "NaN");
}

// Infinity as import writes it (inf, -inf) and as other tools do (+inf,
// Infinity, INF): +1 or -1, 0 for any other text.
int InfinitySign(std::string_view text)
{
    int sign = 1;
    if (!text.empty() && (text[0] == '+' || text[0] == '-')) {
        sign = text[0] == '-' ? -1 : 1;
        text.remove_prefix(1);
    }
    return EqualsIgnoringCase(text, "inf") || EqualsIgnoringCase(text, "infinity") ? sign : 0;
}

// A value of the series: a number, or an infinity, which the export writes
// as the error value a sheet shows for a number beyond its range. False for
// any other text, which ParseNumber then puts into words.
bool ParseValue(const std::string &text, double &value)
{
    if (const int sign = InfinitySign(text)) {
        value = sign * std::numeric_limits<double>::infinity();
        return true;
    }
    const char *end = text.data() + text.size();
    const auto [ptr, error] = std::from_chars(text.data(), end, value);
    return !text.empty() && error == std::errc() && ptr == end && std::isfinite(value);
}

// Spreadsheet programs pad every line of a table they save to the width of the
// widest: empty fields beyond the expected count are that padding.
void DropPadding(std::vector<std::string> &fields, size_t expected)
{
    while (fields.size() > expected && fields.back().empty()) fields.pop_back();
}

// The separator of the text: the first comma or semicolon outside quotes on
// the first line ("title,..." or "title;...").
char FindSeparator(const std::string &text)
{
    bool quoted = false;
    for (const char c : text) {
        if (c == '"') quoted = !quoted;
        else if (!quoted && (c == ',' || c == ';')) return c;
        else if (!quoted && c == '\n') break;
    }
    return ',';
}

bool ReadDigits(const std::string &text, size_t &pos, size_t count, int &value)
{
    value = 0;
    for (size_t i = 0; i < count; ++i, ++pos) {
        if (pos >= text.size() || text[pos] < '0' || text[pos] > '9') return false;
        value = value * 10 + (text[pos] - '0');
    }
    return true;
}

bool Expect(const std::string &text, size_t &pos, char c)
{
    if (pos >= text.size() || text[pos] != c) return false;
    ++pos;
    return true;
}

// Days from 1970-01-01 to a civil date (proleptic Gregorian).
long long DaysFromCivil(int year, unsigned month, unsigned day)
{
    year -= month <= 2;
    const long long era = (year >= 0 ? year : year - 399) / 400;
    const unsigned yoe = unsigned(year - era * 400);
    const unsigned doy = (153 * (month > 2 ? month - 3 : month + 9) + 2) / 5 + day - 1;
    const unsigned doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
    return era * 146097 + (long long)doe - 719468;
}

int ItemTypeSequence(const std::string &name, int &ident)
{
    const int count = kvtGetItemTypeCount();
    for (int seq = 1; seq <= count; ++seq) {
        const char *text = nullptr;
        int candidate = 0;
        if (kvtGetItemTypeSeq(seq, &candidate, &text) && text && EqualsIgnoringCase(name, text)) {
            ident = candidate;
            return seq;
        }
    }
    return 0;
}

int UnitSequence(int itemType, const std::string &name)
{
    const int count = kvtGetItemUnitCount(itemType);
    for (int seq = 1; seq <= count; ++seq) {
        int unit = 0;
        const char *text = nullptr;
        if (!kvtGetItemUnitSeq(itemType, seq, &unit, &text)) continue;
        if (text && EqualsIgnoringCase(name, text)) return seq;
        const char *abbreviation = nullptr;
        if (kvtGetUnitAbbreviation(unit, &abbreviation) && abbreviation && EqualsIgnoringCase(name, abbreviation))
            return seq;
    }
    return 0;
}

LONG ValueTypeNumber(const std::string &text, const std::string &where)
{
    for (size_t i = 0; i < vantrel::ValueTypeNames.size(); ++i)
        if (EqualsIgnoringCase(text, vantrel::ValueTypeNames[i])) return LONG(i);
    int number = 0;
    const char *end = text.data() + text.size();
    const auto [ptr, error] = std::from_chars(text.data(), end, number);
    if (text.empty() || error != std::errc() || ptr != end) Fail(where + "unknown value type " + Quoted(text));
    return number;
}

// A 32-bit item takes its value rounded to the nearest float here, so that
// the float's shortest text (which may lie just beyond the largest float)
// comes back as that float and not as an overflow.
double FitDataType(double value, int dataType, const std::string &where)
{
    if (dataType != ItemDataTypeFloat) return value;
    const float single = static_cast<float>(value);
    if (!std::isfinite(single)) Fail(where + "a value lies beyond the range of a 32-bit float");
    return single;
}

// The parser's message with the text it last read cut to an excerpt.
std::string ShortParseError(const std::string &message)
{
    constexpr std::string_view kLastRead = "; last read: '";
    const size_t at = message.find(kLastRead);
    if (at == std::string::npos || message.back() != '\'') return message;
    const size_t begin = at + kLastRead.size();
    return message.substr(0, at) + "; last read: " + Quoted(std::string_view(message).substr(begin, message.size() - 1 - begin));
}

std::string JsonText(const nlohmann::json &object, const char *key, const std::string &where)
{
    const auto it = object.find(key);
    if (it == object.end()) return std::string();
    if (!it->is_string()) Fail(where + "\"" + key + "\" is no text");
    return it->get<std::string>();
}

}  // namespace

bool ParseTime(const std::string &text, DATE &time)
{
    size_t pos = 0;
    bool negativeYear = false;
    if (!text.empty() && text[0] == '-') {
        negativeYear = true;
        ++pos;
    }
    int year = 0, month = 0, day = 0, hour = 0, minute = 0, second = 0;
    // A 'T' between date and time as ISO 8601 has it; the seconds may be left out.
    if (!ReadDigits(text, pos, 4, year) || !Expect(text, pos, '-') || !ReadDigits(text, pos, 2, month) ||
        !Expect(text, pos, '-') || !ReadDigits(text, pos, 2, day) ||
        !(Expect(text, pos, ' ') || Expect(text, pos, 'T')) || !ReadDigits(text, pos, 2, hour) ||
        !Expect(text, pos, ':') || !ReadDigits(text, pos, 2, minute))
        return false;
    const bool withSeconds = pos < text.size();
    if (withSeconds && (!Expect(text, pos, ':') || !ReadDigits(text, pos, 2, second))) return false;
    int milliseconds = 0;
    if (withSeconds && pos < text.size()) {
        if (!Expect(text, pos, '.')) return false;
        const size_t digits = text.size() - pos;
        if (digits < 1 || digits > 3 || !ReadDigits(text, pos, digits, milliseconds)) return false;
        for (size_t i = digits; i < 3; ++i) milliseconds *= 10;
    }
    if (negativeYear) year = -year;
    static const int kMonthDays[] = {31, 29, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    if (month < 1 || month > 12 || day < 1 || day > kMonthDays[month - 1] || hour > 23 || minute > 59 ||
        second > 59)
        return false;
    const bool leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
    if (month == 2 && day == 29 && !leap) return false;

    // An automation date counts whole days from 1899-12-30 towards its sign;
    // the time of day adds its size away from zero, also before that day.
    const long long days = DaysFromCivil(year, unsigned(month), unsigned(day)) + 25569;
    const double fraction = ((hour * 60.0 + minute) * 60.0 + second + milliseconds / 1000.0) / 86400.0;
    time = days >= 0 ? double(days) + fraction : double(days) - fraction;
    return true;
}

SeriesTable ReadCsvSeries(const std::string &text)
{
    static const char *const kLabels[] = {"title", "item type", "unit", "value type", "delete value"};
    SeriesTable table;
    size_t pos = 0, line = 1;
    const char separator = FindSeparator(text);
    std::vector<std::vector<std::string>> headers;
    for (const char *label : kLabels) {
        const size_t at = line;
        if (pos >= text.size()) Fail(LineText(at) + "the line \"" + label + ",...\" is missing");
        std::vector<std::string> fields;
        NextRecord(text, pos, line, separator, fields);
        if (fields[0] != label) Fail(LineText(at) + "expected \"" + label + ",...\", found " + Quoted(fields[0]));
        headers.push_back(std::move(fields));
    }
    const size_t itemCount = headers[0].size() - 1;
    for (size_t h = 1; h < 4; ++h) DropPadding(headers[h], itemCount + 1);
    DropPadding(headers[4], 2);
    for (size_t h = 1; h < 4; ++h)
        if (headers[h].size() - 1 != itemCount)
            Fail(LineText(h + 1) + std::to_string(headers[h].size() - 1) + " fields for " +
                 std::to_string(itemCount) + " items");
    if (headers[4].size() != 2) Fail(LineText(5) + "expected \"delete value,NUMBER\"");
    table.deleteValue = ParseNumber(headers[4][1], LineText(5));

    table.items.resize(itemCount);
    for (size_t i = 0; i < itemCount; ++i) {
        SeriesItem &item = table.items[i];
        item.title = headers[0][i + 1];
        item.itemType = headers[1][i + 1];
        item.unit = headers[2][i + 1];
        item.valueType = headers[3][i + 1];
        // The texts are 32-bit values; as doubles they stand in the cells as written.
        item.dataType = ItemDataTypeDouble;
    }
    std::vector<std::string> fields;
    while (pos < text.size()) {
        const size_t at = line;
        NextRecord(text, pos, line, separator, fields);
        DropPadding(fields, itemCount + 1);
        if (fields.size() == 1 && fields[0].empty()) continue;  // a blank line
        if (fields.size() != itemCount + 1)
            Fail(LineText(at) + std::to_string(fields.size()) + " fields, expected " + std::to_string(itemCount + 1));
        DATE time = 0;
        if (!ParseTime(fields[0], time))
            Fail(LineText(at) + Quoted(fields[0]) + " is no time YYYY-MM-DD HH:MM:SS");
        table.times.push_back(time);
        for (size_t i = 0; i < itemCount; ++i) {
            const std::string &field = fields[i + 1];
            double value = table.deleteValue;
            // The place is put into words only for a message.
            if (!IsMissing(field) && !ParseValue(field, value)) ParseNumber(field, LineText(at));
            table.items[i].values.push_back(value);
        }
    }
    return table;
}

SeriesTable ReadJsonSeries(const std::string &text)
{
    nlohmann::json document;
    try {
        document = nlohmann::json::parse(text);
    } catch (const nlohmann::json::exception &e) {
        Fail("the series is no JSON: " + ShortParseError(e.what()));
    }
    if (!document.is_object()) Fail("the series is no JSON object");
    SeriesTable table;
    const auto deleteValue = document.find("deleteValue");
    if (deleteValue == document.end() || !deleteValue->is_number()) Fail("\"deleteValue\" is no number");
    table.deleteValue = deleteValue->get<double>();

    const auto times = document.find("times");
    if (times == document.end() || !times->is_array()) Fail("\"times\" is no list");
    for (size_t t = 0; t < times->size(); ++t) {
        const auto &value = (*times)[t];
        DATE time = 0;
        if (!value.is_string() || !ParseTime(value.get<std::string>(), time))
            Fail("times[" + std::to_string(t) + "] is no time YYYY-MM-DD HH:MM:SS");
        table.times.push_back(time);
    }

    const auto items = document.find("items");
    if (items == document.end() || !items->is_array()) Fail("\"items\" is no list");
    for (size_t i = 0; i < items->size(); ++i) {
        const auto &object = (*items)[i];
        const std::string where = "items[" + std::to_string(i) + "]: ";
        if (!object.is_object()) Fail(where + "no object");
        SeriesItem item;
        item.title = JsonText(object, "title", where);
        item.itemType = JsonText(object, "itemType", where);
        item.unit = JsonText(object, "unit", where);
        item.valueType = JsonText(object, "valueType", where);
        item.dataType = ItemDataTypeDouble;
        if (const auto dataType = object.find("dataType"); dataType != object.end()) {
            if (!dataType->is_number_integer() || dataType->get<int>() < 1 || dataType->get<int>() > 7)
                Fail(where + "\"dataType\" is no number from 1 to 7");
            item.dataType = dataType->get<int>();
        }
        const auto values = object.find("values");
        if (values == object.end() || !values->is_array()) Fail(where + "\"values\" is no list");
        for (size_t v = 0; v < values->size(); ++v) {
            const auto &value = (*values)[v];
            if (value.is_null()) {
                item.values.push_back(table.deleteValue);
            } else if (value.is_number()) {
                item.values.push_back(FitDataType(value.get<double>(), item.dataType, where));
            } else if (const std::string place = where + "values[" + std::to_string(v) + "]: ";
                       value.is_string() && (value == "inf" || value == "-inf")) {
                if (item.dataType != ItemDataTypeFloat && item.dataType != ItemDataTypeDouble)
                    Fail(place + "an item of whole numbers holds no infinity");
                item.values.push_back(value == "inf" ? HUGE_VAL : -HUGE_VAL);
            } else {
                if (value == "nan") Fail(place + "\"nan\" is no value a cell can hold; a missing value is null");
                Fail(place + (value.is_string() ? Quoted(value.get_ref<const std::string &>()) + " is" : std::string("a value is")) +
                     " neither a number, \"inf\", \"-inf\" nor null");
            }
        }
        if (item.values.size() != table.times.size())
            Fail(where + std::to_string(item.values.size()) + " values for " + std::to_string(table.times.size()) + " times");
        table.items.push_back(std::move(item));
    }
    return table;
}

SeriesTable ReadSeries(const std::string &text)
{
    // Editors on some systems begin UTF-8 text with a byte-order mark.
    constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
    if (text.starts_with(kByteOrderMark)) return ReadSeries(text.substr(kByteOrderMark.size()));
    const size_t first = text.find_first_not_of(" \t\r\n");
    if (first != std::string::npos && text[first] == '{') return ReadJsonSeries(text);
    return ReadCsvSeries(text);
}

std::string ReadSeriesText(const std::string &path)
{
    if (path == "-") {
        // A pipe has no size to check first: read in blocks and stop at the
        // bound, so that an endless input (a device) can't fill memory.
        std::string text;
        char block[1 << 16];
        while (std::cin.read(block, sizeof block) || std::cin.gcount() > 0) {
            if (text.size() + size_t(std::cin.gcount()) > kMaxSeriesStdinBytes)
                Fail("the series on standard input is longer than 1 GiB; give it as a file");
            text.append(block, size_t(std::cin.gcount()));
        }
        if (std::cin.bad()) Fail("cannot read the series from standard input");
        return text;
    }
    // A regular file only: a device or a FIFO would be read without end.
    std::string text;
    std::string reason;
    if (!vantrel::ReadBoundedFile(path, vantrel::kNoFileBound, text, reason))
        Fail("cannot read the series file " + path + ": " + reason);
    return text;
}

void FillSeries(const SeriesTable &table, IHostSeries &series)
{
    series.SetDeleteValue(table.deleteValue);
    hostseries::SetAxisTimes(series, table.times);
    for (size_t i = 0; i < table.items.size(); ++i) {
        const SeriesItem &source = table.items[i];
        const std::string where = "item " + std::to_string(i + 1) + ": ";
        auto item = hostseries::AddItemWithValues(series, ItemDataType(source.dataType), source.values, source.title);
        int typeIdent = 0;
        if (!source.itemType.empty()) {
            const int seq = ItemTypeSequence(source.itemType, typeIdent);
            if (seq == 0) Fail(where + "unknown item type " + Quoted(source.itemType));
            item->SetItemType(seq);
        }
        if (!source.unit.empty()) {
            const int seq = typeIdent ? UnitSequence(typeIdent, source.unit) : 0;
            if (seq == 0)
                Fail(where + "unknown unit " + Quoted(source.unit) + " of the item type " + Quoted(source.itemType));
            item->SetItemUnit(seq);
        }
        if (!source.valueType.empty()) item->SetValueType(ValueTypeNumber(source.valueType, where));
    }
}

}  // namespace vantrel_cli
