// SPDX-License-Identifier: MIT
// A host string that names an open template, through InspectWorkbook and
// ReadData: the settings replace the reference once, and a template that
// doesn't load is told and fails the inspection.
#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "shell/message_box.h"
#include "support/expect_hr.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace {

using automation::ComPtr;

struct MessageBoxes {
    std::vector<std::string> texts;
    shell::ScopedMessageSink sink{
        [this](std::string_view text, std::string_view) { texts.emplace_back(text); }};
};

ComPtr<IVantrel> MakeBridge(IHostSeries *series)
{
    ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    bridge->SetHostSeries(series);
    return bridge;
}

const char kHeader[] = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<MSExcelVantrelSpecification ";

TEST(TemplateReference, OpenTemplateReplacesTheStringOnceBeforeTheWorkbookIsOpened)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("open.xml");
    std::ofstream(path) << kHeader
                        << "ExcelSheet=\"2\" DataTimeType=\"1\" TimeCol=\"3\" GlobalDate=\"2020-01-02\" "
                           "GlobalTime=\"10:00:00\" UseTFormat=\"true\" TimeFormat=\"'HH:mm'\" StartRow=\"4\" "
                           "UseUnitTypeRow=\"false\" GlobalUnitType=\"Rainfall\" />";
    MessageBoxes boxes;
    // The workbook is missing: the inspection opens nothing and passes.
    auto series = testing_host::MakeSeries(dir.File("absent.xlsx"), "TemplateFilePath=" + path + ";", false);
    auto bridge = MakeBridge(series.Get());
    SHORT fits = 0;
    EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, SHORT(VARIANT_TRUE));
    const std::string expanded = "TimeCol=3;TimeFormat=\"HH:mm\";GlobalDate=2020-01-02;StartRow=4;UnitRow=1;"
                                 "GlobalUnitType=Rainfall;ValueTypeRow=1;ItemDescriptionRow=2;ExcelSheet=2;";
    EXPECT_EQ(testing_host::Specification(series.Get()), expanded);
    EXPECT_TRUE(boxes.texts.empty());

    // The template is used once: a changed file no longer reaches the host object.
    std::ofstream(path) << "not xml";
    EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(testing_host::Specification(series.Get()), expanded);
    EXPECT_TRUE(boxes.texts.empty());
}

TEST(TemplateReference, TemplateThatDoesNotLoadFailsTheInspectionAndIsShownUnlessSilent)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("save.xml");
    // A save template lacks the dates an open template needs: message 143.
    std::ofstream(path) << kHeader
                        << "DateTimeCol=\"1\" UseDTFormat=\"false\" DateTimeFormat=\"x\" UnitTypeRow=\"1\" UnitRow=\"1\" "
                           "ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" UseDelValNotEmpty=\"false\" "
                           "DeleteValueRow=\"2\" />";
    const std::string reference = "TemplateFilePath=" + path + ";StartRow=3;";
    MessageBoxes boxes;
    auto loud = testing_host::MakeSeries(dir.File("absent.xlsx"), reference, false);
    auto bridge = MakeBridge(loud.Get());
    SHORT fits = SHORT(VARIANT_TRUE);
    EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, 0);
    EXPECT_EQ(boxes.texts, (std::vector<std::string>{"The data in the xml File is not valid."}));
    EXPECT_EQ(testing_host::Specification(loud.Get()), reference);

    // A host that never sets the flag is silent: nothing is shown, the verdict is the same.
    auto quiet = testing_host::MakeSeries(dir.File("absent.xlsx"), "TemplateFilePath=" + dir.File("none.xml") + ";");
    auto quietBridge = MakeBridge(quiet.Get());
    EXPECT_HR(E_FAIL, quietBridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, 0);
    EXPECT_EQ(boxes.texts.size(), 1u);

    // A read goes on with the string as it stood, and fails on the workbook.
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(boxes.texts.size(), 2u);
    EXPECT_EQ(boxes.texts.back(), "The data in the xml File is not valid.");
    EXPECT_EQ(testing_host::TakeErrorDescription(), "Excel Workbook could not open file.");
}

}  // namespace
