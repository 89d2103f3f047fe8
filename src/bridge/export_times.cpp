// SPDX-License-Identifier: MIT
#include "bridge/export_times.h"

#include <atomic>
#include <cmath>
#include <cstdio>
#include <exception>
#include <new>
#include <optional>
#include <thread>

#include "automation/com_error.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"

namespace vantrel::bridge {

namespace {

// A time as the messages show it, with milliseconds when it has them.
std::string TimeText(DATE serial)
{
    DateValue date;
    const double millis = std::round(serial * 86400000.0);
    const long rest = serial >= 0 ? long(std::fmod(millis, 1000.0)) : 0;
    date.serial = (millis - double(rest)) / 86400000.0;
    std::string text = CDateTimeUtil::FormatDate(date, "%Y-%m-%d %H:%M:%S");
    if (rest != 0) {
        char fraction[8];
        std::snprintf(fraction, sizeof fraction, ".%03ld", rest);
        text += fraction;
    }
    return text;
}

bool HasSubSecond(DATE serial) { return std::fmod(std::round(serial * 86400000.0), 1000.0) != 0.0; }

// The time cells of the steps as they are stored, made into the cells of
// exportTimes and, one step at a time, into an array of what the import
// reads back. Number formats are counted in formats.
class StoredTimeCells {
public:
    StoredTimeCells(const ExportLayout &layout, ExportTimes &exportTimes, std::vector<std::string> &formats)
        : m_layout(layout), m_export(exportTimes), m_formats(formats),
          m_trueDates(vantrel::datetime::IsQuotedFormat(layout.format) || (layout.subSecond && layout.format.empty())),
          m_stored(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(layout.timeColumns)))
    {
        if (!m_stored.Get()) throw std::bad_alloc();
    }

    // The cells of step t, as ExportTimeCells makes them and the workbook
    // stores them.
    SAFEARRAY *Make(size_t t)
    {
        const DATE time = m_export.times[t];
        TimeCell *cells = m_export.cells.data() + t * size_t(m_layout.timeColumns);
        if (m_trueDates) {
            // A date cell holds the date itself.
            Put(0, automation::Variant::Date(time));
            cells[0] = TimeCell{time, 0, true, true};
            return m_stored.Get();
        }
        DateValue date;
        date.serial = time;
        const std::vector<std::string> texts = CDateTimeUtil::TimeCellTexts(date, m_layout.format);
        for (int c = 0; c < m_layout.timeColumns; ++c) {
            if (size_t(c) >= texts.size()) {
                Put(c, automation::Variant());
                continue;
            }
            CExcelObj::TypedText typed = CExcelObj::StoredText(texts[size_t(c)]);
            if (typed.value.Type() == VT_R8) {
                const auto format = FormatIndex(m_formats, typed.numberFormat);
                if (format) cells[c] = TimeCell{typed.value.Raw().dblVal, *format, true, typed.date};
            }
            Put(c, std::move(typed.value));
        }
        return m_stored.Get();
    }

    static std::optional<uint16_t> FormatIndex(std::vector<std::string> &formats, const std::string &format)
    {
        for (size_t i = 0; i < formats.size(); ++i)
            if (formats[i] == format) return uint16_t(i);
        if (formats.size() > UINT16_MAX) return std::nullopt;
        formats.push_back(format);
        return uint16_t(formats.size() - 1);
    }

private:
    void Put(LONG column, automation::Variant value)
    {
        automation::ThrowIfFailed(SafeArrayPutElement(m_stored.Get(), &column, value.Ptr()), "time cell");
    }

    const ExportLayout &m_layout;
    ExportTimes &m_export;
    std::vector<std::string> &m_formats;
    const bool m_trueDates;
    automation::SafeArray m_stored;
};

// How step t reads back: parsed, the time it reads as.
struct ReadBack {
    bool parsed = false;
    DATE time = 0.0;
};

ReadBack ReadStep(StoredTimeCells &cells, const ExportLayout &layout, size_t t)
{
    // What the cells hold once written, as the import with the same string reads them.
    SAFEARRAY *stored = cells.Make(t);
    automation::Variant read;
    automation::Variant date;
    const bool parsed = CDateTimeUtil::ParseTimeCells(stored, layout.format, layout.mode, read, layout.globalText) &&
                        SUCCEEDED(VariantChangeType(date.Out(), &read.Raw(), 0, VT_DATE));
    return {parsed, parsed ? date.Raw().date : 0.0};
}

bool SameMillisecond(DATE a, DATE b) { return std::round(a * 86400000.0) == std::round(b * 86400000.0); }

// The first of the steps [first, last) that doesn't read back as itself, or
// last; last as well once a step before first has failed elsewhere.
size_t FirstFailure(StoredTimeCells &cells, const ExportLayout &layout, const std::vector<DATE> &times, size_t first,
                    size_t last, const std::atomic<size_t> &failedElsewhere)
{
    for (size_t t = first; t < last; ++t) {
        const ReadBack back = ReadStep(cells, layout, t);
        if (!back.parsed || !SameMillisecond(back.time, times[t])) return t;
        if ((t & 1023) == 0 && failedElsewhere.load(std::memory_order_relaxed) < first) return last;
    }
    return last;
}

// Steps from which the check shares its work with a second thread.
constexpr size_t kStepsForTwoThreads = 16384;

// The first step that doesn't read back, or times.size(). Two threads check
// the two halves of a long series. They share the layout and the times, read
// only, and the atomic step where the first half failed; each writes the
// cells of its own steps alone and counts number formats in its own list,
// merged once both are done.
size_t CheckAllSteps(const ExportLayout &layout, ExportTimes &exportTimes)
{
    const std::vector<DATE> &times = exportTimes.times;
    const size_t count = times.size();
    std::atomic<size_t> frontFailed{count};
    StoredTimeCells front(layout, exportTimes, exportTimes.formats);
    if (count < kStepsForTwoThreads) return FirstFailure(front, layout, times, 0, count, frontFailed);

    const size_t middle = count / 2;
    std::vector<std::string> backFormats{std::string()};
    size_t backFailed = count;
    std::exception_ptr backFault;
    {
        std::jthread back([&] {
            try {
                StoredTimeCells cells(layout, exportTimes, backFormats);
                backFailed = FirstFailure(cells, layout, times, middle, count, frontFailed);
            } catch (...) {
                backFault = std::current_exception();
            }
        });
        try {
            frontFailed = FirstFailure(front, layout, times, 0, middle, frontFailed);
        } catch (...) {
            frontFailed = 0;  // the second half is no longer needed
            throw;            // once back has joined
        }
    }
    if (frontFailed < middle) return frontFailed;
    if (backFault) std::rethrow_exception(backFault);

    // The second half's formats in the one list.
    std::vector<std::optional<uint16_t>> index(backFormats.size());
    bool same = true;
    for (size_t i = 0; i < backFormats.size(); ++i) {
        index[i] = StoredTimeCells::FormatIndex(exportTimes.formats, backFormats[i]);
        same &= index[i] == uint16_t(i);
    }
    if (!same)
        for (size_t c = middle * size_t(exportTimes.columns); c < exportTimes.cells.size(); ++c) {
            TimeCell &cell = exportTimes.cells[c];
            if (!cell.known) continue;
            const auto to = index[cell.format];
            cell.known = to.has_value();
            cell.format = to.value_or(0);
        }
    return backFailed;
}

}  // namespace

bool CheckTimesReadBack(ExportLayout &layout, ExportTimes &exportTimes, std::string &message)
{
    const std::vector<DATE> &times = exportTimes.times;
    layout.subSecond = false;
    for (const DATE time : times) layout.subSecond |= HasSubSecond(time);
    exportTimes.columns = layout.timeColumns;
    exportTimes.cells.assign(times.size() * size_t(layout.timeColumns), TimeCell());
    exportTimes.formats.assign(1, std::string());

    const size_t t = CheckAllSteps(layout, exportTimes);
    if (t == times.size()) return true;
    std::vector<std::string> formats{std::string()};
    StoredTimeCells cells(layout, exportTimes, formats);
    const ReadBack back = ReadStep(cells, layout, t);
    const std::string format = layout.format.empty() ? "the default date/time (no " + layout.formatKey + ")"
                                                     : layout.formatKey + "=" + layout.format;
    message = "Time step " + std::to_string(t + 1) + " (" + TimeText(times[t]) + ") would not read back " +
              (back.parsed ? "as itself but as " + TimeText(back.time) : std::string("at all")) + " under " + format +
              ": " +
              (HasSubSecond(times[t]) && !layout.format.empty()
                   ? "leave " + layout.formatKey + " out, so that the cells are true dates that keep the milliseconds."
                   : "give a format with every field of the time steps (YYYY-MM-DD HH:mm:ss, for one).");
    return false;
}

}  // namespace vantrel::bridge
