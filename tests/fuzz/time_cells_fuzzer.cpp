// SPDX-License-Identifier: MIT
// The cells of one row turned into a point in time: any format, any mode, any
// cells (texts, numbers, dates, empties, errors), any global date or time.
#include <fuzzer/FuzzedDataProvider.h>

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <string>

#include "automation/values.h"
#include "datetime/date_time_util.h"
#include "fuzz_input.h"

namespace {

automation::Variant AnyCell(FuzzedDataProvider &input)
{
    switch (input.ConsumeIntegralInRange<int>(0, 6)) {
    case 0: return automation::Variant::String(input.ConsumeRandomLengthString(64));
    case 1: return automation::Variant::R8(input.ConsumeFloatingPoint<double>());
    case 2: return automation::Variant::Date(input.ConsumeFloatingPoint<double>());
    case 3: return automation::Variant::I4(input.ConsumeIntegral<int32_t>());
    case 4: return automation::Variant::Bool(input.ConsumeBool());
    case 5: return automation::Variant::Error(input.ConsumeIntegral<int32_t>());
    default: return automation::Variant::Empty();
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    FuzzedDataProvider input(data, size);
    const std::string format = input.ConsumeRandomLengthString(64);
    const std::string globalText = input.ConsumeRandomLengthString(64);
    const int mode = input.ConsumeIntegralInRange<int>(-2, 3);
    // Usually as many cells as the format has columns, sometimes fewer or more.
    int count = CDateTimeUtil::GetFormatColumnCount(format);
    if (input.ConsumeIntegralInRange<int>(0, 7) == 0) count = input.ConsumeIntegralInRange<int>(0, 8);
    if (count < 0 || count > 64) count = 1;

    automation::SafeArray cells(SafeArrayCreateVector(VT_VARIANT, 0, static_cast<ULONG>(count)));
    fuzz::Expect(cells.Get() != nullptr, "no array of cells");
    for (LONG index = 0; index < count; ++index) {
        automation::Variant cell = AnyCell(input);
        SafeArrayPutElement(cells.Get(), &index, cell.Ptr());
    }

    automation::Variant result = automation::Variant::String("untouched");
    if (CDateTimeUtil::ParseTimeCells(cells.Get(), format, mode, result, globalText)) {
        fuzz::Expect(result.Type() == VT_DATE, "a point in time that is no date");
        fuzz::Expect(std::isfinite(result.Raw().date), "a date that is no finite number");
    } else {
        fuzz::Expect(result.Type() == VT_BSTR, "a failed parse changed the result");
    }
    return 0;
}
