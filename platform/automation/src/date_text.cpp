// SPDX-License-Identifier: MIT
// Dates and times as text in the fixed locale: "2012-03-04 05:06:07".
#include <cstdio>
#include <new>

#include "automation/com_error.h"
#include "automation/locale.h"
#include "automation/text.h"
#include "calendar.h"
#include "number_text.h"

namespace automation {
namespace {

using detail::DateTimeFields;

std::string DatePart(const DateTimeFields &f)
{
    char buffer[16];
    std::snprintf(buffer, sizeof buffer, "%04d-%02d-%02d", f.year, f.month, f.day);
    return buffer;
}

std::string TimePart(const DateTimeFields &f)
{
    char buffer[16];
    std::snprintf(buffer, sizeof buffer, "%02d:%02d:%02d", f.hour, f.minute, f.second);
    return buffer;
}

// A cursor over the text being read.
class Reader {
public:
    explicit Reader(std::u16string_view text) : text_(text) {}

    bool AtEnd() const { return pos_ == text_.size(); }
    size_t Pos() const { return pos_; }
    void Rewind(size_t pos) { pos_ = pos; }

    size_t SkipBlanks()
    {
        const size_t start = pos_;
        while (!AtEnd() && detail::IsBlank(text_[pos_])) ++pos_;
        return pos_ - start;
    }

    // A decimal number of minDigits to maxDigits digits.
    bool Number(size_t minDigits, size_t maxDigits, int &value)
    {
        size_t n = 0;
        value = 0;
        while (!AtEnd() && n < maxDigits && text_[pos_] >= u'0' && text_[pos_] <= u'9') {
            value = value * 10 + (text_[pos_] - u'0');
            ++pos_;
            ++n;
        }
        // A digit straight after the widest field makes it no field at all.
        const bool moreDigits = !AtEnd() && text_[pos_] >= u'0' && text_[pos_] <= u'9';
        return n >= minDigits && !moreDigits;
    }

    bool Char(char16_t c)
    {
        if (AtEnd() || text_[pos_] != c) return false;
        ++pos_;
        return true;
    }

    char16_t Peek() const { return AtEnd() ? u'\0' : text_[pos_]; }

private:
    std::u16string_view text_;
    size_t pos_ = 0;
};

// year sep month sep day, sep being '-' or '/', the same both times.
bool ReadDate(Reader &in, DateTimeFields &f)
{
    if (!in.Number(1, 4, f.year)) return false;
    const char16_t sep = in.Peek();
    if (sep != u'-' && sep != u'/') return false;
    return in.Char(sep) && in.Number(1, 2, f.month) && in.Char(sep) && in.Number(1, 2, f.day);
}

// hour:minute or hour:minute:second.
bool ReadTime(Reader &in, DateTimeFields &f)
{
    if (!in.Number(1, 2, f.hour) || !in.Char(u':') || !in.Number(1, 2, f.minute)) return false;
    f.second = 0;
    return !in.Char(u':') || in.Number(1, 2, f.second);
}

}  // namespace

std::optional<std::string> FormatDateText(DATE serial, ULONG flags)
{
    DateTimeFields f;
    if (!detail::SerialToFields(serial, f)) return std::nullopt;
    if (flags & VAR_TIMEVALUEONLY) return TimePart(f);
    if (flags & VAR_DATEVALUEONLY) return DatePart(f);
    const bool midnight = f.hour == 0 && f.minute == 0 && f.second == 0;
    const bool firstDay = f.year == 1899 && f.month == 12 && f.day == 30;
    if (firstDay) return TimePart(f);  // serial 0 prints "00:00:00"
    if (midnight) return DatePart(f);
    return DatePart(f) + " " + TimePart(f);
}

std::optional<DATE> ParseDateText(std::u16string_view text, ULONG flags)
{
    Reader in(text);
    DateTimeFields f;  // 30 December 1899, 00:00:00 until read otherwise
    in.SkipBlanks();
    const size_t start = in.Pos();
    const bool haveDate = ReadDate(in, f);
    bool haveTime = false;
    if (!haveDate) {
        in.Rewind(start);
        f = DateTimeFields{};
        haveTime = ReadTime(in, f);
    } else if (in.SkipBlanks() > 0 && !in.AtEnd()) {
        haveTime = ReadTime(in, f);
        if (!haveTime) return std::nullopt;
    }
    in.SkipBlanks();
    if (!(haveDate || haveTime) || !in.AtEnd()) return std::nullopt;
    if (!detail::FieldsAreValid(f)) return std::nullopt;

    if (flags & VAR_TIMEVALUEONLY) {
        f.year = 1899, f.month = 12, f.day = 30;
    } else if (flags & VAR_DATEVALUEONLY) {
        f.hour = f.minute = f.second = 0;
    }
    DATE serial = 0;
    if (!detail::FieldsToSerial(f, serial)) return std::nullopt;
    return serial;
}

}  // namespace automation

// Every LCID is served by the one fixed locale of automation/locale.h.
AUTOMATION_API HRESULT VarBstrFromDate(DATE dateIn, LCID /*lcid*/, ULONG dwFlags, BSTR *pbstrOut)
{
    if (!pbstrOut) return E_INVALIDARG;
    *pbstrOut = nullptr;
    return automation::ComBoundary([&]() -> HRESULT {
        const auto text = automation::FormatDateText(dateIn, dwFlags);
        if (!text) return E_INVALIDARG;
        *pbstrOut = automation::AllocBstr(*text);
        return S_OK;
    });
}

AUTOMATION_API HRESULT VarDateFromStr(LPCOLESTR strIn, LCID /*lcid*/, ULONG dwFlags,
                                      DATE *pdateOut)
{
    if (!strIn || !pdateOut) return E_INVALIDARG;
    const auto serial = automation::ParseDateText(strIn, dwFlags);
    if (!serial) return DISP_E_TYPEMISMATCH;
    *pdateOut = *serial;
    return S_OK;
}
