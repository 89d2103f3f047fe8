// SPDX-License-Identifier: MIT
#include "series_output.h"

#include "float_text.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <future>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <system_error>

#include <nlohmann/json.hpp>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/value_type_names.h"
#include "hostseries/memory_series.h"
#include "units/kvt.h"

namespace vantrel_cli {

namespace {

std::string ItemTypeName(LONG ident)
{
    const char *name = nullptr;
    return kvtGetItemTypeIdent(int(ident), &name) && name ? name : "";
}

std::string UnitName(LONG unit)
{
    const char *name = nullptr;
    return kvtGetUnitKey(int(unit), &name) && name ? name : "";
}

std::string ValueTypeName(LONG number)
{
    if (number >= 0 && size_t(number) < vantrel::ValueTypeNames.size()) return vantrel::ValueTypeNames[size_t(number)];
    return std::to_string(number);
}

bool IsDeleteValue(double value, double deleteValue) { return float(value) == float(deleteValue); }

// The value as the number JSON writes: the double nearest to the float's
// shortest text, read with a decimal point whatever the locale.
double JsonNumber(double value)
{
    const std::string text = FloatText(float(value));
    double number = value;
    std::from_chars(text.data(), text.data() + text.size(), number);
    return number;
}

std::string CsvField(const std::string &text)
{
    if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
    std::string quoted = "\"";
    for (const char c : text) {
        if (c == '"') quoted += '"';
        quoted += c;
    }
    return quoted + "\"";
}

// Day number since 1970-01-01 to the civil date (proleptic Gregorian).
void CivilFromDays(long long days, int &year, unsigned &month, unsigned &day)
{
    days += 719468;
    const long long era = (days >= 0 ? days : days - 146096) / 146097;
    const unsigned doe = unsigned(days - era * 146097);
    const unsigned yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
    const long long y = (long long)yoe + era * 400;
    const unsigned doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
    const unsigned mp = (5 * doy + 2) / 153;
    day = doy - (153 * mp + 2) / 5 + 1;
    month = mp < 10 ? mp + 3 : mp - 9;
    year = int(y + (month <= 2));
}

}  // namespace

SeriesTable TakeSeries(IHostSeries &series)
{
    SeriesTable table;
    series.GetDeleteValue(&table.deleteValue);
    table.times = hostseries::ReadTimes(series);
    LONG count = 0;
    series.GetItemCount(&count);
    for (LONG i = 1; i <= count; ++i) {
        auto item = hostseries::ItemAt(series, i);
        SeriesItem out;
        automation::Bstr title;
        item->GetTitle(title.Out());
        out.title = title.Utf8();
        LONG ident = 0, unit = 0, valueType = 0;
        item->GetItemType(&ident);
        item->GetItemUnit(&unit);
        item->GetValueType(&valueType);
        ItemDataType dataType = ItemDataTypeFloat;
        item->GetDataType(&dataType);
        out.itemType = ItemTypeName(ident);
        out.unit = UnitName(unit);
        out.valueType = ValueTypeName(valueType);
        out.dataType = int(dataType);
        out.values = hostseries::ReadValues(*item.Get());
        table.items.push_back(std::move(out));
    }
    return table;
}

namespace {

// Writes n as `width` digits, zero-padded, at out; n fits in them.
char *PutDigits(char *out, unsigned long long n, int width)
{
    for (int i = width - 1; i >= 0; --i, n /= 10) out[i] = char('0' + n % 10);
    return out + width;
}

}  // namespace

char *WriteTime(char *out, DATE time)
{
    // An automation date counts whole days from 1899-12-30 towards its sign,
    // and the time of day as the fraction's size, also before that day.
    const double whole = std::trunc(time);
    long long days = (long long)whole;
    long long milliseconds = std::llround(std::fabs(time - whole) * 86400000.0);
    if (milliseconds >= 86400000) {
        milliseconds -= 86400000;
        days += time < 0 ? -1 : 1;
    }
    int year = 0;
    unsigned month = 0, day = 0;
    CivilFromDays(days - 25569, year, month, day);
    const long long seconds = milliseconds / 1000;
    char *end = out;
    if (year >= 0 && year <= 9999) {
        // The common case by hand: this runs once a time step.
        end = PutDigits(end, unsigned(year), 4);
        *end++ = '-';
        end = PutDigits(end, month, 2);
        *end++ = '-';
        end = PutDigits(end, day, 2);
        *end++ = ' ';
        end = PutDigits(end, (unsigned long long)(seconds / 3600), 2);
        *end++ = ':';
        end = PutDigits(end, (unsigned long long)(seconds / 60 % 60), 2);
        *end++ = ':';
        end = PutDigits(end, (unsigned long long)(seconds % 60), 2);
    } else {
        end += std::snprintf(out, kMaxTimeText - 4, "%04d-%02u-%02u %02lld:%02lld:%02lld", year, month, day,
                             seconds / 3600, seconds / 60 % 60, seconds % 60);
    }
    if (milliseconds % 1000 != 0) {
        *end++ = '.';
        end = PutDigits(end, (unsigned long long)(milliseconds % 1000), 3);
    }
    return end;
}

std::string FormatTime(DATE time)
{
    char text[kMaxTimeText];
    return std::string(text, WriteTime(text, time));
}

std::string FloatText(float value)
{
    if (std::isnan(value)) return "nan";  // never "-nan": it reads back alike
    std::string text;
    AppendShortestFloat(text, value);
    return text;
}

std::string NotANumberWarning(const SeriesTable &table)
{
    size_t count = 0, firstItem = 0, firstStep = 0;
    for (size_t i = 0; i < table.items.size(); ++i)
        for (size_t step = 0; step < table.items[i].values.size(); ++step) {
            const double value = table.items[i].values[step];
            if (!std::isnan(value) || IsDeleteValue(value, table.deleteValue)) continue;
            if (count++ == 0) {
                firstItem = i + 1;
                firstStep = step + 1;
            }
        }
    if (count == 0) return {};
    std::string text = "item " + std::to_string(firstItem) + ", time step " + std::to_string(firstStep) +
                       ": the value is NaN, which is no number and not the delete value; it is written as nan";
    if (count > 1) text += " (and " + std::to_string(count - 1) + (count == 2 ? " more value)" : " more values)");
    return text;
}

void WriteCsv(const SeriesTable &table, std::ostream &out)
{
    const auto headerLine = [&](const char *label, auto field) {
        std::string line = label;
        for (const SeriesItem &item : table.items) line += "," + CsvField(field(item));
        out << line << "\n";
    };
    headerLine("title", [](const SeriesItem &item) { return item.title; });
    headerLine("item type", [](const SeriesItem &item) { return item.itemType; });
    headerLine("unit", [](const SeriesItem &item) { return item.unit; });
    headerLine("value type", [](const SeriesItem &item) { return item.valueType; });
    out << "delete value," << FloatText(float(table.deleteValue)) << "\n";
    // The time steps are written in blocks, two at a time: the second on
    // another thread while this one writes the first.
    // Each line is written straight into a block with room for the longest.
    struct Block {
        std::unique_ptr<char[]> bytes;
        size_t size = 0;
    };
    const size_t longestLine = kMaxTimeText + table.items.size() * (1 + kMaxFloatText) + 1;
    const auto formatSteps = [&table, longestLine](size_t begin, size_t end) {
        Block block{std::make_unique_for_overwrite<char[]>((end - begin) * longestLine)};
        char *p = block.bytes.get();
        for (size_t step = begin; step < end; ++step) {
            p = WriteTime(p, table.times[step]);
            for (const SeriesItem &item : table.items) {
                *p++ = ',';
                if (step >= item.values.size() || IsDeleteValue(item.values[step], table.deleteValue)) continue;
                if (std::isnan(item.values[step])) p = std::copy_n("nan", 3, p);
                else p = WriteShortestFloat(p, float(item.values[step]));
            }
            *p++ = '\n';
        }
        block.size = size_t(p - block.bytes.get());
        return block;
    };
    const auto write = [&out](const Block &block) { out.write(block.bytes.get(), std::streamsize(block.size)); };
    constexpr size_t kBlockSteps = 8192;
    const size_t steps = table.times.size();
    for (size_t begin = 0; begin < steps; begin += 2 * kBlockSteps) {
        const size_t middle = std::min(steps, begin + kBlockSteps);
        const size_t end = std::min(steps, middle + kBlockSteps);
        std::future<Block> second;
        try {
            if (middle < end) second = std::async(std::launch::async, formatSteps, middle, end);
        } catch (const std::system_error &) {
            // No thread to be had: the second block is written after the first.
        }
        write(formatSteps(begin, middle));
        if (second.valid()) write(second.get());
        else if (middle < end) write(formatSteps(middle, end));
    }
}

void WriteJson(const SeriesTable &table, std::ostream &out)
{
    nlohmann::ordered_json document;
    document["deleteValue"] = JsonNumber(table.deleteValue);
    nlohmann::ordered_json times = nlohmann::ordered_json::array();
    for (const DATE time : table.times) times.push_back(FormatTime(time));
    document["times"] = std::move(times);
    nlohmann::ordered_json items = nlohmann::ordered_json::array();
    for (const SeriesItem &item : table.items) {
        nlohmann::ordered_json values = nlohmann::ordered_json::array();
        for (const double value : item.values) {
            if (IsDeleteValue(value, table.deleteValue)) values.push_back(nullptr);
            else if (std::isfinite(float(value))) values.push_back(JsonNumber(value));
            else values.push_back(FloatText(float(value)));  // JSON has no infinity and no NaN
        }
        items.push_back({{"title", item.title},
                         {"itemType", item.itemType},
                         {"unit", item.unit},
                         {"valueType", item.valueType},
                         {"dataType", item.dataType},
                         {"values", std::move(values)}});
    }
    document["items"] = std::move(items);
    out << document.dump(2) << "\n";
}

}  // namespace vantrel_cli
