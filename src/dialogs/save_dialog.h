// SPDX-License-Identifier: MIT
// CGUISaveDlg: the modal window in which a user describes how the host's
// time series shall be laid out in a workbook: the file, the date/time
// column and format, the header rows and the delete value row, with a
// preview of the first time steps as the sheet would show them. On OK it
// stores the specification string and the path in the host object and
// closes; the export follows.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include <QCheckBox>
#include <QDialog>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QRadioButton>
#include <QTableWidget>

#include "dialogs/dialog_to_string.h"
#include "dialogs/format_combo.h"
#include "dialogs/number_field.h"
#include "dialogs/preview_reader.h"
#include "dialogs/save_dialog_fields.h"
#include "hostseries/hostseries.h"
#include "specification/records.h"

class CExcelVantrel;
class CXmlTemplateDoc;

class CGUISaveDlg : public QDialog, public CDialogKeySource {
    Q_OBJECT
public:
    explicit CGUISaveDlg(QWidget *parent = nullptr);

    // The host object and the bridge, both kept alive by the caller. False,
    // with nothing changed, for a null series.
    bool SetHost(IHostSeries *hostSeries, CExcelVantrel *bridge);

    // The keys out of the committed fields.
    bool GetDialogKeyValue(int key, std::string &value) const override;

    // Commits, checks the rows (a failure is told in a box and leaves the
    // preview as it was) and lays the host object out in the preview.
    void FillSavePreview();
    // Puts a run of texts into the line of sheet row row, from list column
    // firstColumn (0-based).
    void SetPreviewRow(int row, int firstColumn, int count, const std::vector<std::string> &texts);
    // True without a format of the user's; else whether its fields are well
    // formed (error gets message 140 if not).
    bool CheckFormatLetters(std::string &error) const;

    // Controls into fields; false when a number field refused its text.
    bool Commit();
    // Fields into controls.
    void Display();

    // ---- Templates ----
    // The file text of a save template from the committed fields.
    bool BuildTemplateText(std::string &text) const;
    // Writes the text to path as it is given; false when it can't be written.
    bool WriteTemplateFile(const std::string &path) const;
    // Loads a save template, or else an open template, into the controls;
    // failures are told in boxes and change nothing.
    bool LoadTemplateFile(const std::string &path);
    // These look at no dialog: the open dialog uses them too.
    static bool ReadTemplate(CXmlTemplateDoc &document, SaveSpecification &record);
    // The rows of a save template; each fault found goes to a box at once.
    static bool CheckRows(const SaveSpecification &record);
    // What an open template says that an export can use.
    void ApplyOpenSpecification(const OpenSpecification &record);
    void ApplySaveSpecification(const SaveSpecification &record);

    const vantrel::dialogs::SaveDialogFields &Fields() const { return m_fields; }
    const vantrel::dialogs::PreviewList &Preview() const { return m_preview; }
    QTableWidget *PreviewListControl() const { return m_previewList; }

public slots:
    void OnOK();
    void OnBrowseFile();
    void OnBrowseTemplate();

protected:
    // A field's loss of focus is recognised here, by the control.
    bool eventFilter(QObject *watched, QEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void OnInitDialog();
    void Exchange(bool commit);
    void EnableTemplatePath(bool enabled);
    void EnableDeleteRow(bool enabled);
    void OnMultiColumnsClicked();
    void OnFormatLeft();
    void OnNumberFieldLeft();
    void OnTemplatePathLeft();
    void DrawPreview();
    // The path chosen in a file chooser; none on cancel.
    std::optional<std::string> ChooseFile(bool saveKind, const char *filter, const char *suffix);

    vantrel::dialogs::SaveDialogFields m_fields;
    vantrel::dialogs::PreviewList m_preview;
    IHostSeries *m_hostSeries = nullptr;
    CExcelVantrel *m_bridge = nullptr;
    bool m_lastExchangeOk = true;

    QLineEdit *m_filePathEdit;
    QPushButton *m_browseFile;
    QRadioButton *m_noTemplate, *m_useTemplate, *m_saveTemplate;
    QLineEdit *m_templatePathEdit;
    QPushButton *m_browseTemplate;
    CNumberField *m_dateTimeColumn;
    QCheckBox *m_multiColumnsBox;
    CDTFormatCMB *m_formatCombo;
    CNumberField *m_unitTypeRow, *m_valueTypeRow, *m_dataStartRow, *m_unitRow, *m_itemDescriptionRow;
    QCheckBox *m_useDeleteRowBox;
    CNumberField *m_deleteValueRow;
    QTableWidget *m_previewList;
    // Why the preview stands still: rows out of order, told while the person types.
    QLabel *m_previewProblem;
    QPushButton *m_ok, *m_cancel;
};
