// SPDX-License-Identifier: MIT
// Arbitrary sheet, shared strings and styles parts inside an otherwise sound
// package: the engine opens it, reads every cell of the used range, writes a
// cell, saves and reads the result again. Refusing with the engine's error is
// fine; any other way out is a finding. Far more of each input reaches the
// readers than through raw zip bytes.
#include <fuzzer/FuzzedDataProvider.h>

#include <cstddef>
#include <cstdint>
#include <string>

#include "automation/com_error.h"
#include "automation/values.h"
#include "fuzz_input.h"
#include "workbook/engine.h"
#include "zip_writer.h"

namespace {

constexpr const char *kRelationships = "http://schemas.openxmlformats.org/officeDocument/2006/relationships";

std::string Package(std::string sheet, std::string sharedStrings, std::string styles)
{
    workbook::ZipBuilder zip;
    zip.AddBytes("[Content_Types].xml",
                 "<?xml version=\"1.0\"?><Types xmlns=\"http://schemas.openxmlformats.org/package/2006/content-types\">"
                 "<Default Extension=\"rels\" ContentType=\"application/vnd.openxmlformats-package.relationships+xml\"/>"
                 "<Default Extension=\"xml\" ContentType=\"application/xml\"/>"
                 "<Override PartName=\"/xl/workbook.xml\" "
                 "ContentType=\"application/vnd.openxmlformats-officedocument.spreadsheetml.sheet.main+xml\"/>"
                 "<Override PartName=\"/xl/worksheets/sheet1.xml\" "
                 "ContentType=\"application/vnd.openxmlformats-officedocument.spreadsheetml.worksheet+xml\"/></Types>");
    zip.AddBytes("_rels/.rels",
                 "<?xml version=\"1.0\"?><Relationships xmlns=\"http://schemas.openxmlformats.org/package/2006/relationships\">"
                 "<Relationship Id=\"rId1\" Type=\"" + std::string(kRelationships) +
                     "/officeDocument\" Target=\"xl/workbook.xml\"/></Relationships>");
    zip.AddBytes("xl/workbook.xml",
                 "<?xml version=\"1.0\"?><workbook xmlns=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\" "
                 "xmlns:r=\"" + std::string(kRelationships) +
                     "\"><sheets><sheet name=\"Data\" sheetId=\"1\" r:id=\"rId1\"/></sheets></workbook>");
    zip.AddBytes("xl/_rels/workbook.xml.rels",
                 "<?xml version=\"1.0\"?><Relationships xmlns=\"http://schemas.openxmlformats.org/package/2006/relationships\">"
                 "<Relationship Id=\"rId1\" Type=\"" + std::string(kRelationships) + "/worksheet\" Target=\"worksheets/sheet1.xml\"/>"
                 "<Relationship Id=\"rId2\" Type=\"" + std::string(kRelationships) + "/sharedStrings\" Target=\"sharedStrings.xml\"/>"
                 "<Relationship Id=\"rId3\" Type=\"" + std::string(kRelationships) + "/styles\" Target=\"styles.xml\"/>"
                 "</Relationships>");
    zip.AddBytes("xl/worksheets/sheet1.xml", std::move(sheet));
    zip.AddBytes("xl/sharedStrings.xml", std::move(sharedStrings));
    zip.AddBytes("xl/styles.xml", std::move(styles));
    return zip.Finish();
}

void ReadEverySheet(workbook::Workbook &book)
{
    auto sheets = book.GetWorksheets();
    for (int32_t i = 1; i <= sheets->Count(); ++i) sheets->Item(i)->UsedRange()->GetValue2();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static fuzz::ScratchFile file(".xlsx");
    static fuzz::ScratchFile saved("-saved.xlsx");
    FuzzedDataProvider input(data, size);
    std::string sharedStrings = input.ConsumeRandomLengthString(4096);
    std::string styles = input.ConsumeRandomLengthString(4096);
    std::string sheet = input.ConsumeRemainingBytesAsString();
    const std::string &path = file.Write(Package(std::move(sheet), std::move(sharedStrings), std::move(styles)));

    auto app = workbook::CreateApplication();
    try {
        auto book = app->GetWorkbooks()->Open(path);
        ReadEverySheet(*book);
        book->GetWorksheets()->Item(1)->GetRange("B2")->SetValue2(automation::Variant::String("written").Raw());
        const std::string &savedPath = saved.Write("");
        book->SaveAs(savedPath);
        book->Close(false);
        // What the engine wrote, it reads again.
        auto again = app->GetWorkbooks()->Open(savedPath);
        ReadEverySheet(*again);
    } catch (const automation::ComError &) {
    }
    app->Quit();
    return 0;
}
