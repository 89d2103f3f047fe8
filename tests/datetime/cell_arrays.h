// SPDX-License-Identifier: MIT
// One-dimensional arrays of variants, as the rows of a cell block, for tests.
#pragma once

#include <gtest/gtest.h>

#include <initializer_list>
#include <string>
#include <vector>

#include "automation/automation.h"
#include "automation/values.h"

namespace datetime_test {

// 4 March 2012, and 05:06:07 as a fraction of a day.
inline constexpr double kMarch4th2012 = 40972.0;
inline constexpr double kSixMinutesPastFive = (5 * 3600 + 6 * 60 + 7) / 86400.0;
inline constexpr double kOneSecond = 1.0 / 86400.0;

inline automation::SafeArray MakeCells(std::vector<automation::Variant> values)
{
    automation::SafeArray cells(
        SafeArrayCreateVector(VT_VARIANT, 0, static_cast<ULONG>(values.size())));
    EXPECT_NE(cells.Get(), nullptr);
    for (size_t i = 0; i < values.size(); ++i) {
        LONG index = static_cast<LONG>(i);
        EXPECT_EQ(SafeArrayPutElement(cells.Get(), &index, values[i].Ptr()), S_OK);
    }
    return cells;
}

inline automation::SafeArray TextCells(std::initializer_list<const char *> texts)
{
    std::vector<automation::Variant> values;
    for (const char *text : texts) values.push_back(automation::Variant::String(text));
    return MakeCells(std::move(values));
}

inline automation::SafeArray EmptyCells(ULONG count)
{
    return automation::SafeArray(SafeArrayCreateVector(VT_VARIANT, 0, count));
}

inline automation::Variant CellAt(SAFEARRAY *cells, LONG index)
{
    automation::Variant value;
    EXPECT_EQ(SafeArrayGetElement(cells, &index, value.Out()), S_OK);
    return value;
}

inline std::string TextAt(SAFEARRAY *cells, LONG index)
{
    const automation::Variant value = CellAt(cells, index);
    EXPECT_EQ(value.Type(), VT_BSTR) << "element " << index;
    return value.Type() == VT_BSTR ? automation::BstrToUtf8(value.Raw().bstrVal) : std::string();
}

}  // namespace datetime_test
