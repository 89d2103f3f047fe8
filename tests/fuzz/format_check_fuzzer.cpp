// SPDX-License-Identifier: MIT
// A cell's text against a date/time column format, and the format operations
// that the dialogs and the import run on what a user typed.
#include <fuzzer/FuzzedDataProvider.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "datetime/date_time_util.h"
#include "fuzz_input.h"
#include "module/string_table.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    FuzzedDataProvider input(data, size);
    const std::string format = input.ConsumeRandomLengthString(256);
    const std::string value = input.ConsumeRemainingBytesAsString();

    std::string error = "stale";
    const bool fits = CDateTimeUtil::CheckValueAgainstFormat(value, format, error);
    if (fits) fuzz::Expect(error.empty(), "a fitting value with a message");
    else
        fuzz::Expect(error.empty() || error == vantrel::LoadMessage(117) || error == vantrel::LoadMessage(118),
                     "a failed check with a message other than 117 or 118");

    CDateTimeUtil::CheckFormatLetters(format, error);
    const int columns = CDateTimeUtil::GetFormatColumnCount(format);
    fuzz::Expect(columns >= 0, "a negative column count");
    std::vector<std::string> titles;
    CDateTimeUtil::GetColumnTitles(format, titles);
    for (int index = 0; index <= columns; ++index) {
        std::string columnFormat;
        if (CDateTimeUtil::GetColumnFormat(index, format, columnFormat)) {
            std::string title;
            CDateTimeUtil::GetColumnTitle(columnFormat, title);
        }
    }
    const int kind = CDateTimeUtil::ClassifyFormat(format);
    fuzz::Expect(kind == kFormatDateAndTime || kind == kFormatDateOnly || kind == kFormatTimeOnly ||
                     kind == kFormatIncomplete,
                 "a format class out of range");
    return 0;
}
