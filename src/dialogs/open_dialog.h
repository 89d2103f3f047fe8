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

class CExcelVantrel;

class CGUIOpenDlg : public QDialog, public CDialogKeySource {
    Q_OBJECT
public:
    explicit CGUIOpenDlg(QWidget *parent = nullptr);

    // The host object and the bridge, both kept alive by the caller.
    void SetHost(IHostSeries *hostSeries, CExcelVantrel *bridge);

    // The keys of the dialog and its pages out of their committed fields.
    bool GetDialogKeyValue(int key, std::string &value) const override;

    // Stores the present string and path in the host object and points the
    // preview at the workbook and the first selected sheet. Always true.
    bool RefreshPreviewSource();
    // What showing the preview page does: commit everything, refresh the
    // source, refresh the preview.
    void RefreshFromPreviewPage();

    bool Commit();
    void Display();

    // The template side: a load fills the controls from a template file, a
    // write saves the controls into one. Loading isn't offered yet and says
    // so; writing reports false and nothing is written.
    bool LoadTemplateFile(const std::string &path);
    bool WriteTemplateFile(const std::string &path);

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
