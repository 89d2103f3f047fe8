// SPDX-License-Identifier: MIT
// A host string that names an open template, through InspectWorkbook and
// ReadData: the settings replace the reference once, and a template that
// doesn't load is told and fails the inspection.
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "support/bridge_factory.h"
#include "support/files.h"
#include "support/message_boxes.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace {

using Texts = std::vector<std::string>;

const std::string kRoot = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<MSExcelVantrelSpecification ";

TEST(TemplateReference, OpenTemplateReplacesTheStringOnce)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("open.xml");
    testing_host::WriteFile(path, kRoot + "ExcelSheet=\"2\" DataTimeType=\"1\" TimeCol=\"3\" GlobalDate=\"2020-01-02\" "
                                          "GlobalTime=\"10:00:00\" UseTFormat=\"true\" TimeFormat=\"'HH:mm'\" StartRow=\"4\" "
                                          "UseUnitTypeRow=\"false\" GlobalUnitType=\"Rainfall\" />");
    testing_host::MessageBoxes boxes;
    // The workbook is missing: the inspection opens nothing and passes.
    auto series = testing_host::MakeSeries(dir.File("absent.xlsx"), "TemplateFilePath=" + path + ";", false);
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    const std::string expanded = "TimeCol=3;TimeFormat=\"HH:mm\";GlobalDate=2020-01-02;StartRow=4;UnitRow=1;"
                                 "GlobalUnitType=Rainfall;ValueTypeRow=1;ItemDescriptionRow=2;ExcelSheet=2;";
    // Used once: a changed file no longer reaches the host object.
    for (const char *file : {"as written", "changed"}) {
        SHORT fits = 0;
        EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits)) << file;
        EXPECT_EQ(fits, SHORT(VARIANT_TRUE)) << file;
        EXPECT_EQ(testing_host::Specification(series.Get()), expanded) << file;
        testing_host::WriteFile(path, "not xml");
    }
    EXPECT_TRUE(boxes.texts.empty());
}

TEST(TemplateReference, TemplateThatDoesNotLoadFailsTheInspectionAndIsShownUnlessSilent)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("save.xml");
    // A save template lacks the dates an open template needs.
    testing_host::WriteFile(path, kRoot + "DateTimeCol=\"1\" UseDTFormat=\"false\" DateTimeFormat=\"x\" UnitTypeRow=\"1\" "
                                          "UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" "
                                          "UseDelValNotEmpty=\"false\" DeleteValueRow=\"2\" />");
    const std::string reference = "TemplateFilePath=" + path + ";StartRow=3;";
    testing_host::MessageBoxes boxes;
    // A host that never sets the flag is silent; one that asks is shown the message.
    for (const std::optional<bool> silent : {std::optional<bool>(), std::optional<bool>(false)}) {
        auto series = testing_host::MakeSeries(dir.File("absent.xlsx"), reference, silent);
        auto bridge = testing_host::MakeBridge();
        bridge->SetHostSeries(series.Get());
        SHORT fits = SHORT(VARIANT_TRUE);
        EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
        EXPECT_EQ(fits, 0);
        EXPECT_EQ(testing_host::Specification(series.Get()), reference);
        EXPECT_EQ(boxes.texts.size(), silent ? 1u : 0u);
        if (!silent) continue;
        // A read goes on with the string as it stood, and fails on the workbook.
        EXPECT_HR(E_FAIL, bridge->ReadData());
        EXPECT_EQ(boxes.texts, (Texts{"The data in the xml File is not valid.", "The data in the xml File is not valid."}));
        EXPECT_EQ(testing_host::TakeErrorDescription(),
                  "Excel Workbook could not open file.\n" + dir.File("absent.xlsx") + ": no such file");
    }
}

}  // namespace
