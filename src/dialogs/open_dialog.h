// SPDX-License-Identifier: MIT
// CGUIOpenDlg: the modal window in which a user describes a workbook for an
// import: the workbook, the sheets, a template choice, and the three pages
// "Time description", "Data description" and "Preview". On OK it stores the
// specification string and the path in the host object and closes only when
// the bridge's inspection passes.
#pragma once

#include <optional>
#include <string>

#include <QDialog>
#include <QLineEdit>
#include <QPushButton>
#include <QRadioButton>

#include "dialogs/data_page.h"
#include "dialogs/dialog_to_string.h"
#include "dialogs/open_dialog_fields.h"
#include "dialogs/preview_page.h"
#include "dialogs/tab_sheet.h"
#include "dialogs/time_page.h"
#include "hostseries/hostseries.h"
#include "specification/records.h"

class CExcelVantrel;
class CXmlTemplateDoc;

class CGUIOpenDlg : public QDialog, public CDialogKeySource {
    Q_OBJECT
public:
    explicit CGUIOpenDlg(QWidget *parent = nullptr);

    // The host object and the bridge, both kept alive by the caller.
    void SetHost(IHostSeries *hostSeries, CExcelVantrel *bridge);

    // The keys of the dialog and its pages out of their committed fields.
    bool GetDialogKeyValue(int key, std::string &value) const override;

    // Stores the present string and path in the host object and points the
    // preview at the workbook and the first selected sheet. False when the
    // sheets field names no sheet to show (the person has been told).
    bool RefreshPreviewSource();
    // What showing the preview page does: commit everything, refresh the
    // source, refresh the preview.
    void RefreshFromPreviewPage();

    bool Commit();
    void Display();

    // ---- Templates ----
    // The file text of an open template from the committed fields of the
    // dialog and its pages.
    bool BuildTemplateText(std::string &text) const;
    // Writes the text; a path without any extension gets ".xml". False when
    // the file can't be written.
    bool WriteTemplateFile(const std::string &path) const;
    // Loads an open template, or else a save template, into the controls;
    // failures are told in boxes and change nothing.
    bool LoadTemplateFile(const std::string &path);
    // These look at no dialog: the save dialog uses them too.
    static bool ReadTemplate(CXmlTemplateDoc &document, OpenSpecification &record);
    // The global date and time parse, and CheckTemplateRows holds.
    static bool CheckTemplate(const OpenSpecification &record);
    // The bridge's row check of an open template, with the title row always tested.
    static bool CheckTemplateRows(const OpenSpecification &record);
    void ApplyOpenSpecification(const OpenSpecification &record);
    void ApplySaveSpecification(const SaveSpecification &record);

    const vantrel::dialogs::OpenDialogFields &Fields() const { return m_fields; }
    CTimePageDlg &TimePage() { return *m_timePage; }
    CDataPageDlg &DataPage() { return *m_dataPage; }
    COpenPreviewPageDlg &PreviewPage() { return *m_previewPage; }
    CTabSheet &TabSheet() { return *m_tabSheet; }

    void done(int result) override;

public slots:
    void OnOK();
    void OnBrowseFile();
    void OnBrowseTemplate();

protected:
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void OnInitDialog();
    void Exchange(bool commit);
    void EnableTemplatePath(bool enabled);
    void OnTemplateRadio(int mode);
    void OnTemplatePathLeft();
    void OnSheetsLeft();
    // The path chosen in a file chooser; none on cancel.
    std::optional<std::string> ChooseFile(bool saveKind, const char *filter, const char *suffix);
    void Warn(int message);

    vantrel::dialogs::OpenDialogFields m_fields;
    IHostSeries *m_hostSeries = nullptr;
    CExcelVantrel *m_bridge = nullptr;

    QLineEdit *m_filePathEdit;
    QPushButton *m_browseFile;
    QRadioButton *m_noTemplate, *m_useTemplate, *m_saveTemplate;
    QLineEdit *m_templatePathEdit;
    QPushButton *m_browseTemplate;
    QLineEdit *m_sheetsEdit;
    CTabSheet *m_tabSheet;
    CTimePageDlg *m_timePage;
    CDataPageDlg *m_dataPage;
    COpenPreviewPageDlg *m_previewPage;
    QPushButton *m_ok, *m_cancel;
};
