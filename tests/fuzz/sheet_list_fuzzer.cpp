// SPDX-License-Identifier: MIT
// The sheet list text against a sheet count: whatever the text, every number
// that comes out names a sheet that exists.
#include <fuzzer/FuzzedDataProvider.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz_input.h"
#include "specification/specification.h"

namespace {

bool Blank(const std::string &text) { return text.find_first_not_of(' ') == std::string::npos; }

void ExpectSheetsExist(const std::vector<int32_t> &sheets, int sheetCount)
{
    for (int32_t sheet : sheets)
        fuzz::Expect(sheet >= 1 && sheet <= sheetCount, "a sheet number outside 1 to the sheet count");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    FuzzedDataProvider input(data, size);
    // Workbooks hold at most 10,000 sheets, so a count beyond that never comes.
    const int sheetCount = input.ConsumeIntegralInRange<int>(-2, 10000);
    const std::string text = input.ConsumeRemainingBytesAsString();
    CSpecification specification;

    std::vector<int32_t> sheets;
    const bool parsed = specification.ParseSheetList(text, sheetCount, sheets);
    if (Blank(text)) {
        // A blank text means the first sheet, whatever the count.
        fuzz::Expect(parsed && sheets == std::vector<int32_t>{1}, "a blank sheet text that isn't sheet 1");
    } else {
        ExpectSheetsExist(sheets, sheetCount);
    }

    sheets.clear();
    specification.ParseSheetItem(text, sheetCount, sheets);
    ExpectSheetsExist(sheets, sheetCount);

    // Through the key, as an import reads it.
    sheets.clear();
    const bool listed = specification.GetSheetList("ExcelSheet=" + text + ";", sheetCount, sheets);
    ExpectSheetsExist(sheets, sheetCount);
    if (listed && text.find_first_of(";=") == std::string::npos && Blank(text))
        fuzz::Violated("a key with a blank value gave a list");
    return 0;
}
