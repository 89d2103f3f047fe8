// SPDX-License-Identifier: MIT
// The open dialog's templates: writing the dialog and its pages as an open
// template, and loading an open template (or a save template) into them
// through the pages' setters.
#include <cstring>
#include <string>

#include "datetime/date_time_util.h"
#include "dialogs/dialog_texts.h"
#include "dialogs/field_parsing.h"
#include "dialogs/open_dialog.h"
#include "dialogs/save_dialog.h"
#include "dialogs/template_text.h"
#include "module/string_table.h"
#include "shell/shell.h"
#include "specification/specification.h"
#include "specification/xml_template_doc.h"

using namespace vantrel::dialogs;

namespace {

void Show(const char *text)
{
    MessageBoxA(nullptr, text, vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK | MB_ICONEXCLAMATION);
}

// A template's date or time text in the words of the user's locale; an
// invalid value when it doesn't parse.
DateValue Parsed(const std::string &text, ULONG flags)
{
    DateValue value;
    CDateTimeUtil::ParseDateTimeText(value, text, flags, LOCALE_USER_DEFAULT);
    return value;
}

// The title row test counts whatever the record's title option says.
OpenSpecification WithTitleRowTested(OpenSpecification record)
{
    record.UseItemTitleOption = -1;
    return record;
}

}  // namespace

bool CGUIOpenDlg::BuildTemplateText(std::string &text) const
{
    text = ComposeTemplateText(OpenTemplateAttributes(m_fields, m_timePage->Fields(), m_dataPage->Fields()));
    return true;
}

bool CGUIOpenDlg::WriteTemplateFile(const std::string &path) const
{
    char buffer[MAX_PATH] = {};
    std::strncpy(buffer, path.c_str(), MAX_PATH - 1);
    PathAddExtensionA(buffer, ".xml");
    std::string text;
    BuildTemplateText(text);
    return WriteTemplateText(path.size() < MAX_PATH ? std::string(buffer) : path, text);
}

bool CGUIOpenDlg::ReadTemplate(CXmlTemplateDoc &document, OpenSpecification &record)
{
    // The bridge's reader, without what the dialog has no place for: the
    // options keep the record's values, and the lists and selected items stay
    // in the reader.
    OpenSpecification read = record;
    if (!CSpecification().ReadOpenTemplate(document, read)) return false;
    read.UseUnitTypeOption = record.UseUnitTypeOption;
    read.UseUnitOption = record.UseUnitOption;
    read.UseValueTypeOption = record.UseValueTypeOption;
    read.UseItemTitleOption = record.UseItemTitleOption;
    record = read;
    return true;
}

bool CGUIOpenDlg::CheckTemplate(const OpenSpecification &record)
{
    return CSpecification().CheckOpenSpecification(WithTitleRowTested(record));
}

bool CGUIOpenDlg::CheckTemplateRows(const OpenSpecification &record)
{
    return CSpecification().CheckOpenRows(WithTitleRowTested(record));
}

bool CGUIOpenDlg::LoadTemplateFile(const std::string &path)
{
    CXmlTemplateDoc document;
    if (!document.InitDocument()) {
        Show(texts::kXmlCannotInitialise);
        return false;
    }
    if (!document.LoadFile(path)) {
        Show(texts::kXmlCannotOpen);
        return false;
    }
    std::string reason;
    if (!document.ValidateSchema(LongTemplateSchema(), reason)) {
        Show(texts::kXmlNotValid);
        return false;
    }
    // Both kinds are read; an open template is tried first.
    OpenSpecification openRecord;
    ReadTemplate(document, openRecord);
    SaveSpecification saveRecord;
    CGUISaveDlg::ReadTemplate(document, saveRecord);
    if (CheckTemplate(openRecord)) {
        ApplyOpenSpecification(openRecord);
        return true;
    }
    if (CGUISaveDlg::CheckRows(saveRecord)) {
        ApplySaveSpecification(saveRecord);
        return true;
    }
    Show(texts::kXmlDataNotValid);
    return false;
}

void CGUIOpenDlg::ApplyOpenSpecification(const OpenSpecification &r)
{
    m_fields.m_excelSheets = r.ExcelSheet;

    CTimePageDlg &time = *m_timePage;
    time.SetDateCol(r.DateCol);
    time.SetDateFormat(r.DateFormat);
    time.SetDateTimeCol(r.DateTimeCol);
    time.SetDateTimeFormat(r.DateTimeFormat);
    time.SetGlobalDate(Parsed(r.GlobalDate, VAR_DATEVALUEONLY));
    time.SetGlobalTime(Parsed(r.GlobalTime, VAR_TIMEVALUEONLY));
    time.SetTimeCol(r.TimeCol);
    time.SetTimeFormat(r.TimeFormat);
    // The mode and then the boxes, so the enabled states end up matching them.
    time.SetTimeMode(r.DataTimeType);
    time.SetUseDTFormat(r.UseDTFormat);
    time.SetUseDFormat(r.UseDFormat);
    time.SetUseTFormat(r.UseTFormat);

    CDataPageDlg &data = *m_dataPage;
    // As a double, so that it comes back exactly; the six decimals of older
    // templates ("-9999.000000") read as they always did.
    double deleteValue = 0;
    if (ParseNumber(r.DeleteValue, deleteValue)) data.SetDeleteValue(deleteValue);
    data.SetDeleteValueRow(r.DeleteValueRow);
    // The item type before the unit: the units on offer depend on it.
    data.SelectItemType(r.GlobalUnitType);
    data.SelectUnit(r.GlobalUnit);
    data.SelectValueType(r.GlobalValueType);
    data.SetItemDescriptionRow(r.ItemDescriptionRow);
    data.SetStartRow(r.StartRow);
    data.SetUnitRow(r.UnitRow);
    data.SetItemTypeRow(r.UnitTypeRow);
    data.SetValueTypeRow(r.ValueTypeRow);
    data.SetItemTypeInRow(r.UseUnitTypeRow);
    data.SetUnitInRow(r.UseUnitRow);
    data.SetValueTypeInRow(r.UseValueTypeRow);
    data.SetUseDelValNotEmpty(r.UseDelValNotEmpty);
    data.SetDeleteValueInRow(r.UseDeleteValueRow);
}

void CGUIOpenDlg::ApplySaveSpecification(const SaveSpecification &r)
{
    // A save template knows no sheets: the first one.
    m_fields.m_excelSheets = OpenSpecification().ExcelSheet;

    const DateValue zero{0.0, kDateValid};
    CTimePageDlg &time = *m_timePage;
    time.SetDateCol(1);
    time.SetDateFormat("YYYY/MM/DD");
    time.SetDateTimeCol(r.DateTimeCol);
    time.SetDateTimeFormat(r.DateTimeFormat);
    time.SetGlobalDate(zero);
    time.SetGlobalTime(zero);
    time.SetTimeCol(1);
    time.SetTimeFormat("HH:mm:ss");
    time.SetTimeMode(0);
    time.SetUseDTFormat(r.UseDTFormat);
    time.SetUseDFormat(0);
    time.SetUseTFormat(0);

    CDataPageDlg &data = *m_dataPage;
    data.SetDeleteValueRow(r.DeleteValueRow);
    data.SetUseDelValNotEmpty(r.UseDelValNotEmpty);
    data.SetDeleteValueInRow(r.UseDelValNotEmpty);
    data.SetItemDescriptionRow(r.ItemDescriptionRow);
    data.SetStartRow(r.StartRow);
    data.SetUnitRow(r.UnitRow);
    data.SetItemTypeRow(r.UnitTypeRow);
    data.SetValueTypeRow(r.ValueTypeRow);
    data.SetItemTypeInRow(1);
    data.SetUnitInRow(1);
    data.SetValueTypeInRow(1);
}
