// SPDX-License-Identifier: MIT
// The save dialog's templates: writing its fields as a save template, and
// loading a save template (or an open template, as far as an export can use
// it) into its controls.
#include <string>

#include "dialogs/dialog_texts.h"
#include "dialogs/open_dialog.h"
#include "dialogs/save_dialog.h"
#include "dialogs/template_text.h"
#include "module/string_table.h"
#include "shell/shell.h"
#include "specification/specification.h"
#include "specification/xml_template_doc.h"

using namespace vantrel::dialogs;

namespace {

constexpr int kMessageNotValid = 134;
constexpr int kMessageCannotOpen = 135;
constexpr int kMessageCannotInitialise = 136;
constexpr int kMessageNegativeRows = 137;
constexpr int kMessageStartRowNotBelow = 115;
constexpr int kMessageTitleRowShared = 116;

void Show(const std::string &text)
{
    MessageBoxA(nullptr, text.c_str(), vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK | MB_ICONEXCLAMATION);
}

}  // namespace

bool CGUISaveDlg::BuildTemplateText(std::string &text) const
{
    text = ComposeTemplateText(SaveTemplateAttributes(m_fields));
    return true;
}

bool CGUISaveDlg::WriteTemplateFile(const std::string &path) const
{
    std::string text;
    BuildTemplateText(text);
    return WriteTemplateText(path, text);
}

bool CGUISaveDlg::ReadTemplate(CXmlTemplateDoc &document, SaveSpecification &record)
{
    return CSpecification().ReadSaveTemplate(document, record);
}

bool CGUISaveDlg::CheckRows(const SaveSpecification &r)
{
    bool ok = true;
    const bool negative =
        r.UnitTypeRow < 1 || r.UnitRow < 1 || r.ValueTypeRow < 1 || r.ItemDescriptionRow < 1 || r.StartRow < 1;
    if (negative) {
        Show(vantrel::LoadMessage(kMessageNegativeRows));
        ok = false;
    }
    if (r.UnitTypeRow >= r.StartRow || r.UnitRow >= r.StartRow || r.ValueTypeRow >= r.StartRow ||
        r.ItemDescriptionRow >= r.StartRow) {
        Show(vantrel::LoadMessage(kMessageStartRowNotBelow));
        ok = false;
    }
    if (!negative && (r.ItemDescriptionRow == r.UnitTypeRow || r.ItemDescriptionRow == r.UnitRow ||
                      r.ItemDescriptionRow == r.ValueTypeRow)) {
        Show(vantrel::LoadMessage(kMessageTitleRowShared));
        ok = false;
    }
    return ok;
}

bool CGUISaveDlg::LoadTemplateFile(const std::string &path)
{
    CXmlTemplateDoc document;
    if (!document.InitDocument()) {
        Show(vantrel::LoadMessage(kMessageCannotInitialise));
        return false;
    }
    if (!document.LoadFile(path)) {
        Show(vantrel::LoadMessage(kMessageCannotOpen));
        return false;
    }
    // The reason of a failed validation is no business of the user's.
    std::string reason;
    if (document.ValidateSchema(ShortTemplateSchema(), reason)) {
        SaveSpecification record;
        ReadTemplate(document, record);
        if (!CheckRows(record)) return false;
        ApplySaveSpecification(record);
        return true;
    }
    if (document.ValidateSchema(LongTemplateSchema(), reason)) {
        OpenSpecification record;
        CGUIOpenDlg::ReadTemplate(document, record);
        if (!CGUIOpenDlg::CheckTemplate(record)) {
            Show(texts::kXmlDataNotValid);
            return false;
        }
        ApplyOpenSpecification(record);
        return true;
    }
    Show(vantrel::LoadMessage(kMessageNotValid));
    return false;
}

void CGUISaveDlg::ApplySaveSpecification(const SaveSpecification &record)
{
    m_fields.m_dateTimeColumn = record.DateTimeCol;
    m_fields.m_multiColumns = record.UseDTFormat;
    m_fields.m_format = record.DateTimeFormat;
    m_fields.m_unitTypeRow = record.UnitTypeRow;
    m_fields.m_saveUnitRow = record.UnitRow;
    m_fields.m_saveValueTypeRow = record.ValueTypeRow;
    m_fields.m_saveItemDescriptionRow = record.ItemDescriptionRow;
    m_fields.m_dataStartRow = record.StartRow;
    m_fields.m_useDeleteRow = record.UseDelValNotEmpty;
    m_fields.m_saveDeleteValueRow = record.DeleteValueRow;
    m_formatCombo->setEnabled(record.UseDTFormat == 1);
    EnableDeleteRow(record.UseDelValNotEmpty == 1);
    Display();
}

void CGUISaveDlg::ApplyOpenSpecification(const OpenSpecification &record)
{
    if (record.UseUnitTypeRow == 1) m_fields.m_unitTypeRow = record.UnitTypeRow;
    if (record.UseUnitRow == 1) m_fields.m_saveUnitRow = record.UnitRow;
    if (record.UseValueTypeRow == 1) m_fields.m_saveValueTypeRow = record.ValueTypeRow;
    m_fields.m_saveItemDescriptionRow = record.ItemDescriptionRow;
    m_fields.m_dataStartRow = record.StartRow;
    if (record.DataTimeType == 0) {
        m_fields.m_dateTimeColumn = record.DateTimeCol;
        m_fields.m_multiColumns = record.UseDTFormat;
        if (record.UseDTFormat == 1) m_fields.m_format = record.DateTimeFormat;
    }
    m_fields.m_useDeleteRow = record.UseDelValNotEmpty;
    if (record.UseDelValNotEmpty == 1 && record.UseDeleteValueRow == 1)
        m_fields.m_saveDeleteValueRow = record.DeleteValueRow;
    // The combo follows its box, whichever kind of template set it.
    m_formatCombo->setEnabled(m_fields.m_multiColumns == 1);
    EnableDeleteRow(record.UseDelValNotEmpty == 1);
    Display();
}
