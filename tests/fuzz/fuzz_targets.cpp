// SPDX-License-Identifier: MIT
// The libFuzzer targets, one harness: each target is this file built with
// FUZZ_TARGET naming the function below that it runs. A crash, a hang or a
// broken promise (Expect) is a finding; refusing an input is not.
#include <fuzzer/FuzzedDataProvider.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <set>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "automation/values.h"
#include "cells/cell_ref.h"
#include "datetime/date_time_util.h"
#include "minimal_package.h"
#include "module/string_table.h"
#include "specification/records.h"
#include "specification/specification.h"
#include "workbook/engine.h"

// Named, not anonymous: each build uses one of the targets and no more.
namespace fuzz {

void Expect(bool condition, const char *what)
{
    if (condition) return;
    std::fprintf(stderr, "fuzz check failed: %s\n", what);
    std::abort();
}

// Inputs that must pass through a file go to a file of this process for each
// suffix, rewritten for each input, in the folder of temporary files, and
// removed when the process ends.
std::string Scratch(const std::string &bytes, const std::string &suffix)
{
    static struct Files {
        std::set<std::string> paths;
        ~Files()
        {
            for (const std::string &path : paths) std::remove(path.c_str());
        }
    } files;
    const char *folder = std::getenv("TMPDIR");
    const std::string path = std::string(folder && *folder ? folder : "/tmp") + "/vantrel-fuzz-" +
                             std::to_string(::getpid()) + suffix;
    files.paths.insert(path);
    std::FILE *file = std::fopen(path.c_str(), "wb");
    Expect(file != nullptr, "cannot write the scratch file");
    std::fwrite(bytes.data(), 1, bytes.size(), file);
    std::fclose(file);
    return path;
}

// Every key of a specification string, the numeric reading, the date/time
// layout and the template reference.
void SpecificationString(FuzzedDataProvider &input)
{
    const std::string spec = input.ConsumeRemainingBytesAsString();
    CSpecification specification;
    for (int key = -1; key <= kParsingTypeCount; ++key) {
        std::string name;
        const bool known = specification.GetKeyName(key, name);
        Expect(known == (key >= 0 && key < kParsingTypeCount), "GetKeyName answers for 0 to 21 only");
        std::string value = "untouched";
        if (specification.GetKeyValue(spec, key, value)) {
            Expect(known && value.size() <= spec.size() && spec.find(name) != std::string::npos,
                   "a value for an unknown key, longer than the string or for a key that isn't in it");
        } else {
            Expect(value == "untouched", "a failed GetKeyValue changed the value");
        }
        int number = 0;
        specification.GetKeyValueInt(spec, key, number);
    }
    int column = -7, columnCount = 0, mode = -7;
    std::string format, path;
    Expect(specification.GetDateTimeLayout(spec, column, columnCount, mode, format), "GetDateTimeLayout is always true");
    Expect(mode == -7 || (mode >= 0 && mode <= 2), "a layout mode outside 0 to 2");
    Expect(columnCount >= 0, "a negative column count");
    if (specification.GetTemplateReference(spec, path))
        Expect(spec.find("TemplateFilePath") != std::string::npos, "a template reference without its key");
}

// The sheet list text against a sheet count: every number that comes out
// names a sheet that exists.
void SheetList(FuzzedDataProvider &input)
{
    // Workbooks hold at most 10,000 sheets, so a count beyond that never comes.
    const int sheetCount = input.ConsumeIntegralInRange<int>(-2, 10000);
    const std::string text = input.ConsumeRemainingBytesAsString();
    const bool blank = text.find_first_not_of(' ') == std::string::npos;
    const auto expectSheetsExist = [&](const std::vector<int32_t> &sheets) {
        for (int32_t sheet : sheets) Expect(sheet >= 1 && sheet <= sheetCount, "a sheet number outside 1 to the sheet count");
    };
    CSpecification specification;
    std::vector<int32_t> sheets;
    const bool parsed = specification.ParseSheetList(text, sheetCount, sheets);
    // A blank text means the first sheet, whatever the count.
    if (blank) Expect(parsed && sheets == std::vector<int32_t>{1}, "a blank sheet text that isn't sheet 1");
    else expectSheetsExist(sheets);
    // Through the key, as an import reads it (on to ParseSheetItem too).
    sheets.clear();
    const std::string spec = "ExcelSheet=" + text + ";";
    const bool listed = specification.GetSheetList(spec, sheetCount, sheets);
    // The value as the key reads it ("ExcelSheet==2;" holds an empty one) decides.
    std::string value;
    specification.GetKeyValue(spec, ExcelSheet, value);
    if (value.find_first_not_of(' ') == std::string::npos)
        Expect(listed && sheets == std::vector<int32_t>{1}, "a blank sheet key that isn't sheet 1");
    else expectSheetsExist(sheets);
}

// A cell's text against a date/time column format, and the format operations
// that the dialogs and the import run on what a user typed.
void FormatCheck(FuzzedDataProvider &input)
{
    const std::string format = input.ConsumeRandomLengthString(256);
    const std::string value = input.ConsumeRemainingBytesAsString();
    std::string error = "stale";
    if (CDateTimeUtil::CheckValueAgainstFormat(value, format, error))
        Expect(error.empty(), "a fitting value with a message");
    else
        Expect(error.empty() || error == vantrel::LoadMessage(117) || error == vantrel::LoadMessage(118),
               "a failed check with a message other than 117 or 118");
    CDateTimeUtil::CheckFormatLetters(format, error);
    const int columns = CDateTimeUtil::GetFormatColumnCount(format);
    Expect(columns >= 0, "a negative column count");
    std::vector<std::string> titles;
    CDateTimeUtil::GetColumnTitles(format, titles);
    for (int index = 0; index <= columns; ++index) {
        std::string columnFormat, title;
        if (CDateTimeUtil::GetColumnFormat(index, format, columnFormat)) CDateTimeUtil::GetColumnTitle(columnFormat, title);
    }
    const int kind = CDateTimeUtil::ClassifyFormat(format);
    Expect(kind == kFormatDateAndTime || kind == kFormatDateOnly || kind == kFormatTimeOnly || kind == kFormatIncomplete,
           "a format class out of range");
}

// The cells of one row turned into a point in time: any format, any mode, any
// cells (texts, numbers, dates, empties, errors), any global date or time.
void TimeCells(FuzzedDataProvider &input)
{
    const std::string format = input.ConsumeRandomLengthString(64);
    const std::string globalText = input.ConsumeRandomLengthString(64);
    const int mode = input.ConsumeIntegralInRange<int>(-2, 3);
    // Usually as many cells as the format has columns, sometimes fewer or more.
    int count = CDateTimeUtil::GetFormatColumnCount(format);
    if (input.ConsumeIntegralInRange<int>(0, 7) == 0) count = input.ConsumeIntegralInRange<int>(0, 8);
    if (count < 0 || count > 64) count = 1;
    automation::SafeArray cells(SafeArrayCreateVector(VT_VARIANT, 0, static_cast<ULONG>(count)));
    Expect(cells.Get() != nullptr, "no array of cells");
    for (LONG index = 0; index < count; ++index) {
        automation::Variant cell;
        switch (input.ConsumeIntegralInRange<int>(0, 6)) {
        case 0: cell = automation::Variant::String(input.ConsumeRandomLengthString(64)); break;
        case 1: cell = automation::Variant::R8(input.ConsumeFloatingPoint<double>()); break;
        case 2: cell = automation::Variant::Date(input.ConsumeFloatingPoint<double>()); break;
        case 3: cell = automation::Variant::I4(input.ConsumeIntegral<int32_t>()); break;
        case 4: cell = automation::Variant::Bool(input.ConsumeBool()); break;
        case 5: cell = automation::Variant::Error(input.ConsumeIntegral<int32_t>()); break;
        default: break;
        }
        SafeArrayPutElement(cells.Get(), &index, cell.Ptr());
    }
    automation::Variant result = automation::Variant::String("untouched");
    if (CDateTimeUtil::ParseTimeCells(cells.Get(), format, mode, result, globalText))
        Expect(result.Type() == VT_DATE && std::isfinite(result.Raw().date), "a point in time that is no finite date");
    else
        Expect(result.Type() == VT_BSTR, "a failed parse changed the result");
}

// A template file of arbitrary bytes, loaded as an open and as a save template:
// a load may fail, with a message.
void TemplateLoading(FuzzedDataProvider &input)
{
    const std::string path = Scratch(input.ConsumeRemainingBytesAsString(), ".xml");
    CSpecification openReader, saveReader;
    OpenSpecification open;
    SaveSpecification save;
    std::string error;
    if (!openReader.LoadOpenTemplate(path, open, error)) Expect(!error.empty(), "an open template failed without a message");
    error.clear();
    if (!saveReader.LoadSaveTemplate(path, save, error)) Expect(!error.empty(), "a save template failed without a message");
}

// Opens path with the engine and reads every sheet's used range, as an import
// does; then, if asked, writes a cell, saves, and reads what it wrote again.
void OpenAndRead(const std::string &path, bool saveAndReread)
{
    auto app = workbook::CreateApplication();
    try {
        auto book = app->GetWorkbooks()->Open(path);
        auto sheets = book->GetWorksheets();
        for (int32_t i = 1; i <= sheets->Count(); ++i) {
            // Two cells far apart make a used range of millions of cells from a
            // few bytes: beyond a million, the corners stand for the whole.
            auto sheet = sheets->Item(i);
            auto used = sheet->UsedRange();
            if (used->Count() <= 1'000'000) {
                used->GetValue2();
                continue;
            }
            const auto address = [](int32_t row, int32_t column) {
                return workbook::ColumnName(uint32_t(column)) + std::to_string(row);
            };
            const int32_t rows = std::min<int32_t>(used->Count() / used->Columns()->Count(), 1000);
            const int32_t columns = std::min<int32_t>(used->Columns()->Count(), 100);
            sheet->GetRange(address(used->Row(), used->Column()),
                            address(used->Row() + rows - 1, used->Column() + columns - 1))->GetValue2();
        }
        if (saveAndReread) {
            sheets->Item(1)->GetRange("B2")->SetValue2(automation::Variant::String("written").Raw());
            const std::string saved = Scratch("", "-saved.xlsx");
            book->SaveAs(saved);
            book->Close(false);
            OpenAndRead(saved, false);
        }
    } catch (const automation::ComError &) {
    }
    app->Quit();
}

// A file of arbitrary bytes.
void WorkbookOpen(FuzzedDataProvider &input)
{
    OpenAndRead(Scratch(input.ConsumeRemainingBytesAsString(), ".xlsx"), false);
}

// Delimited text of arbitrary bytes, read through the engine as a .csv.
void TextReader(FuzzedDataProvider &input)
{
    OpenAndRead(Scratch(input.ConsumeRemainingBytesAsString(), ".csv"), false);
}

// Arbitrary sheet, shared strings and styles parts inside an otherwise sound
// package: far more of each input reaches the readers than through zip bytes.
void WorkbookParts(FuzzedDataProvider &input)
{
    const std::string sharedStrings = input.ConsumeRandomLengthString(4096);
    const std::string styles = input.ConsumeRandomLengthString(4096);
    const engine_test::Parts parts = engine_test::Replace(engine_test::MinimalPackage("", sharedStrings, styles),
                                                          "xl/worksheets/sheet1.xml", input.ConsumeRemainingBytesAsString());
    OpenAndRead(Scratch(engine_test::PackageBytes(parts), ".xlsx"), true);
}

// Raw bytes as a binary workbook: the compound file, the records, the texts.
void XlsReader(FuzzedDataProvider &input)
{
    OpenAndRead(Scratch(input.ConsumeRemainingBytesAsString(), ".xls"), false);
}

// An OpenDocument spreadsheet whose content part is the input: the .ods
// reader streams it into a converted book, which then opens as any workbook.
void OdsReader(FuzzedDataProvider &input)
{
    const engine_test::Parts parts{{"mimetype", "application/vnd.oasis.opendocument.spreadsheet"},
                                   {"content.xml", input.ConsumeRemainingBytesAsString()}};
    OpenAndRead(Scratch(engine_test::PackageBytes(parts), ".ods"), false);
}

}  // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    FuzzedDataProvider input(data, size);
    fuzz::FUZZ_TARGET(input);
    return 0;
}
