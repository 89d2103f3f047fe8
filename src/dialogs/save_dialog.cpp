// SPDX-License-Identifier: MIT
#include "dialogs/save_dialog.h"

#include <cstring>
#include <exception>
#include <memory>

#include <QFileDialog>
#include <QFocusEvent>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QVBoxLayout>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "datetime/date_time_util.h"
#include "datetime/format_presets.h"
#include "dialogs/bridge_preview_access.h"
#include "dialogs/dialog_texts.h"
#include "dialogs/field_exchange.h"
#include "dialogs/tab_order.h"
#include "dialogs/save_preview.h"
#include "module/string_table.h"
#include "shell/shell.h"
#include "specification/specification.h"

using namespace vantrel::dialogs;

namespace {

constexpr int kSpinLow = 1;
constexpr int kSpinHigh = 100;
// From this version on the engine writes the xlsx format.
constexpr int kFirstXlsxVersion = 12;

QString Text(const char *text) { return QString::fromUtf8(text); }

QLabel *Label(const char *text, QWidget *parent) { return new QLabel(Text(text), parent); }

bool LeavesByUser(const QFocusEvent *event)
{
    // Another window coming up (a box, a chooser) or a drop-down is no leaving.
    return event->reason() != Qt::ActiveWindowFocusReason && event->reason() != Qt::PopupFocusReason;
}

void ShowPlain(const std::string &text, unsigned type = MB_OK)
{
    MessageBoxA(nullptr, text.c_str(), vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), type);
}

std::string Trimmed(const std::string &text)
{
    const auto first = text.find_first_not_of(" \t\r\n");
    if (first == std::string::npos) return {};
    const auto last = text.find_last_not_of(" \t\r\n");
    return text.substr(first, last - first + 1);
}

}  // namespace

CGUISaveDlg::CGUISaveDlg(QWidget *parent)
    : QDialog(parent),
      m_filePathEdit(new QLineEdit(this)),
      m_browseFile(new QPushButton(Text(texts::kBrowse), this)),
      m_noTemplate(new QRadioButton(Text(texts::kNoTemplate), this)),
      m_useTemplate(new QRadioButton(Text(texts::kUseTemplate), this)),
      m_saveTemplate(new QRadioButton(Text(texts::kSaveTemplate), this)),
      m_templatePathEdit(new QLineEdit(this)),
      m_browseTemplate(new QPushButton(Text(texts::kBrowse), this)),
      m_dateTimeColumn(new CNumberField("dateTimeColumn", this)),
      m_multiColumnsBox(new QCheckBox(Text(texts::kMultipleColumns), this)),
      m_formatCombo(new CDTFormatCMB(this)),
      m_unitTypeRow(new CNumberField("unitTypeRow", this)),
      m_valueTypeRow(new CNumberField("valueTypeRow", this)),
      m_dataStartRow(new CNumberField("dataStartRow", this)),
      m_unitRow(new CNumberField("unitRow", this)),
      m_itemDescriptionRow(new CNumberField("itemDescriptionRow", this)),
      m_useDeleteRowBox(new QCheckBox(Text(texts::kDeleteValueNotEmpty), this)),
      m_deleteValueRow(new CNumberField("deleteValueRow", this)),
      m_previewList(new QTableWidget(this)),
      m_previewProblem(new QLabel(this)),
      m_ok(new QPushButton(Text(texts::kOk), this)),
      m_cancel(new QPushButton(Text(texts::kCancel), this))
{
    setWindowTitle(Text(texts::kSaveTitle));
    setObjectName("saveDialog");
    m_filePathEdit->setObjectName("filePath");
    m_browseFile->setObjectName("browseFile");
    m_noTemplate->setObjectName("noTemplate");
    m_useTemplate->setObjectName("useTemplate");
    m_saveTemplate->setObjectName("saveTemplate");
    m_templatePathEdit->setObjectName("templatePath");
    m_browseTemplate->setObjectName("browseTemplate");
    m_multiColumnsBox->setObjectName("multiColumns");
    m_formatCombo->setObjectName("format");
    m_useDeleteRowBox->setObjectName("useDeleteRow");
    m_previewList->setObjectName("previewList");
    m_ok->setObjectName("ok");
    m_cancel->setObjectName("cancel");
    for (QPushButton *browse : {m_browseFile, m_browseTemplate}) browse->setFixedWidth(32);
    m_ok->setDefault(true);
    m_ok->setAutoDefault(true);
    m_cancel->setAutoDefault(false);
    m_noTemplate->setChecked(true);
    m_previewList->verticalHeader()->hide();
    m_previewList->setEditTriggers(QAbstractItemView::NoEditTriggers);
    m_previewList->horizontalHeader()->setHighlightSections(false);
    m_previewList->setWordWrap(false);
    m_previewList->setTabKeyNavigation(false);  // Tab goes on to OK
    // Room for the header rows and several time steps when the dialog opens.
    m_previewList->setMinimumSize(640, 240);
    m_previewProblem->setObjectName("previewProblem");
    m_previewProblem->setWordWrap(true);
    m_previewProblem->setStyleSheet("color: #b00000");
    m_previewProblem->hide();

    auto *outer = new QVBoxLayout(this);
    auto *file = new QHBoxLayout;
    file->addWidget(Label(texts::kFilePath, this));
    file->addWidget(m_filePathEdit, 1);
    file->addWidget(m_browseFile);
    outer->addLayout(file);

    auto *templates = new QGroupBox(this);
    auto *templateGrid = new QGridLayout(templates);
    auto *radios = new QHBoxLayout;
    radios->addWidget(m_noTemplate);
    radios->addWidget(m_useTemplate);
    radios->addWidget(m_saveTemplate);
    radios->addStretch(1);
    templateGrid->addLayout(radios, 0, 0, 1, 3);
    templateGrid->addWidget(Label(texts::kFilePath, templates), 1, 0);
    templateGrid->addWidget(m_templatePathEdit, 1, 1);
    templateGrid->addWidget(m_browseTemplate, 1, 2);
    outer->addWidget(templates);

    auto *format = new QGroupBox(Text(texts::kDataFormatGroup), this);
    auto *formatGrid = new QGridLayout(format);
    formatGrid->addWidget(Label(texts::kTimeSavedAs, format), 0, 0, 1, 4);
    formatGrid->addWidget(Label(texts::kSaveDateTimeColumn, format), 1, 0);
    formatGrid->addWidget(m_dateTimeColumn, 1, 1);
    formatGrid->addWidget(m_multiColumnsBox, 2, 0);
    formatGrid->addWidget(m_formatCombo, 2, 1, 1, 2);
    formatGrid->addWidget(Label(texts::kDateTimeLegend, format), 3, 1, 1, 3);
    formatGrid->addWidget(Label(texts::kDescriptionSavedAs, format), 4, 0, 1, 4);
    formatGrid->addWidget(Label(texts::kUnitTypeRow, format), 5, 0);
    formatGrid->addWidget(m_unitTypeRow, 5, 1);
    formatGrid->addWidget(Label(texts::kUnitRow, format), 5, 2);
    formatGrid->addWidget(m_unitRow, 5, 3);
    formatGrid->addWidget(Label(texts::kValueTypeRow, format), 6, 0);
    formatGrid->addWidget(m_valueTypeRow, 6, 1);
    formatGrid->addWidget(Label(texts::kItemDescriptionRow, format), 6, 2);
    formatGrid->addWidget(m_itemDescriptionRow, 6, 3);
    formatGrid->addWidget(Label(texts::kDataStartRow, format), 7, 0);
    formatGrid->addWidget(m_dataStartRow, 7, 1);
    formatGrid->addWidget(m_useDeleteRowBox, 8, 0);
    formatGrid->addWidget(Label(texts::kDeleteValueRow, format), 8, 2);
    formatGrid->addWidget(m_deleteValueRow, 8, 3);
    formatGrid->setColumnStretch(4, 1);
    outer->addWidget(format);

    auto *preview = new QGroupBox(Text(texts::kPreviewGroup), this);
    auto *previewLayout = new QVBoxLayout(preview);
    previewLayout->addWidget(m_previewProblem);
    previewLayout->addWidget(m_previewList);
    outer->addWidget(preview, 1);

    auto *buttons = new QHBoxLayout;
    buttons->addStretch(1);
    buttons->addWidget(m_ok);
    buttons->addWidget(m_cancel);
    outer->addLayout(buttons);

    ChainTabOrder({m_filePathEdit, m_browseFile, m_noTemplate, m_useTemplate, m_saveTemplate, m_templatePathEdit,
                   m_browseTemplate, m_dateTimeColumn->Edit(), m_multiColumnsBox, m_formatCombo, m_unitTypeRow->Edit(),
                   m_unitRow->Edit(), m_valueTypeRow->Edit(), m_itemDescriptionRow->Edit(), m_dataStartRow->Edit(),
                   m_useDeleteRowBox, m_deleteValueRow->Edit(), m_previewList, m_ok, m_cancel});

    connect(m_ok, &QPushButton::clicked, this, &CGUISaveDlg::OnOK);
    connect(m_cancel, &QPushButton::clicked, this, &QDialog::reject);
    connect(m_browseFile, &QPushButton::clicked, this, &CGUISaveDlg::OnBrowseFile);
    connect(m_browseTemplate, &QPushButton::clicked, this, &CGUISaveDlg::OnBrowseTemplate);
    connect(m_noTemplate, &QRadioButton::clicked, this, [this] { EnableTemplatePath(false); });
    connect(m_useTemplate, &QRadioButton::clicked, this, [this] { EnableTemplatePath(true); });
    connect(m_saveTemplate, &QRadioButton::clicked, this, [this] { EnableTemplatePath(true); });
    connect(m_multiColumnsBox, &QCheckBox::clicked, this, &CGUISaveDlg::OnMultiColumnsClicked);
    connect(m_useDeleteRowBox, &QCheckBox::clicked, this,
            [this] { EnableDeleteRow(m_useDeleteRowBox->isChecked()); });
    connect(m_formatCombo, &CDTFormatCMB::focusLeft, this, &CGUISaveDlg::OnFormatLeft);
    m_templatePathEdit->installEventFilter(this);
    for (CNumberField *field :
         {m_dateTimeColumn, m_unitTypeRow, m_valueTypeRow, m_dataStartRow, m_unitRow, m_itemDescriptionRow,
          m_deleteValueRow})
        field->Edit()->installEventFilter(this);

    OnInitDialog();
}

void CGUISaveDlg::OnInitDialog()
{
    EnableTemplatePath(false);
    m_formatCombo->setEnabled(false);
    EnableDeleteRow(false);
    const std::pair<CNumberField *, int> spins[] = {
        {m_dateTimeColumn, m_fields.m_dateTimeColumn}, {m_unitTypeRow, m_fields.m_unitTypeRow},
        {m_valueTypeRow, m_fields.m_saveValueTypeRow}, {m_dataStartRow, m_fields.m_dataStartRow},
        {m_deleteValueRow, m_fields.m_saveDeleteValueRow}, {m_itemDescriptionRow, m_fields.m_saveItemDescriptionRow},
        {m_unitRow, m_fields.m_saveUnitRow}};
    for (const auto &[field, position] : spins) {
        field->Spin()->SetRange(kSpinLow, kSpinHigh);
        field->Spin()->SetPosition(position);
    }
    m_previewList->setShowGrid(true);
    m_previewList->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_formatCombo->FillPresets(vantrel::datetime::FormatPresetDateTime);
    Display();
}

bool CGUISaveDlg::SetHost(IHostSeries *hostSeries, CExcelVantrel *bridge)
{
    if (!hostSeries) return false;
    m_hostSeries = hostSeries;
    m_bridge = bridge;
    return true;
}

bool CGUISaveDlg::GetDialogKeyValue(int key, std::string &value) const
{
    return CSaveDialogKeys(m_fields).GetDialogKeyValue(key, value);
}

void CGUISaveDlg::Exchange(bool commit)
{
    CFieldExchange exchange(commit ? vantrel::dialogs::Exchange::Commit : vantrel::dialogs::Exchange::Display);
    exchange.Text(m_filePathEdit, m_fields.m_filePath);
    exchange.Text(m_templatePathEdit, m_fields.m_templatePath);
    exchange.WholeNumber(m_dateTimeColumn->Edit(), m_fields.m_dateTimeColumn, texts::kSaveDateTimeColumn);
    exchange.Radio({m_noTemplate, m_useTemplate, m_saveTemplate}, m_fields.m_templateMode);
    exchange.WholeNumber(m_unitTypeRow->Edit(), m_fields.m_unitTypeRow, texts::kUnitTypeRow);
    exchange.WholeNumber(m_valueTypeRow->Edit(), m_fields.m_saveValueTypeRow, texts::kValueTypeRow);
    exchange.WholeNumber(m_dataStartRow->Edit(), m_fields.m_dataStartRow, texts::kDataStartRow);
    exchange.WholeNumber(m_deleteValueRow->Edit(), m_fields.m_saveDeleteValueRow, texts::kDeleteValueRow);
    exchange.WholeNumber(m_itemDescriptionRow->Edit(), m_fields.m_saveItemDescriptionRow,
                         texts::kItemDescriptionRow);
    exchange.WholeNumber(m_unitRow->Edit(), m_fields.m_saveUnitRow, texts::kUnitRow);
    exchange.EditText(m_formatCombo, m_fields.m_format);
    exchange.Check(m_useDeleteRowBox, m_fields.m_useDeleteRow);
    exchange.Check(m_multiColumnsBox, m_fields.m_multiColumns);
    m_lastExchangeOk = exchange.Succeeded();
}

bool CGUISaveDlg::Commit()
{
    Exchange(true);
    return m_lastExchangeOk;
}

void CGUISaveDlg::Display() { Exchange(false); }

void CGUISaveDlg::EnableTemplatePath(bool enabled)
{
    m_templatePathEdit->setEnabled(enabled);
    m_browseTemplate->setEnabled(enabled);
}

void CGUISaveDlg::EnableDeleteRow(bool enabled) { m_deleteValueRow->SetAllEnabled(enabled); }

void CGUISaveDlg::OnMultiColumnsClicked()
{
    Commit();
    m_formatCombo->setEnabled(m_multiColumnsBox->isChecked());
    FillSavePreview();
}

void CGUISaveDlg::OnFormatLeft()
{
    Commit();
    m_formatCombo->AddIfMissing(m_fields.m_format);
    FillSavePreview();
}

void CGUISaveDlg::OnNumberFieldLeft()
{
    // A refused commit has told why; the preview waits for a number.
    if (!Commit()) return;
    FillSavePreview();
}

void CGUISaveDlg::OnTemplatePathLeft()
{
    Commit();
    if (!m_saveTemplate->isChecked()) return;
    // A path without any extension gets ".xml".
    char buffer[MAX_PATH] = {};
    std::strncpy(buffer, m_fields.m_templatePath.c_str(), MAX_PATH - 1);
    PathAddExtensionA(buffer, ".xml");
    m_fields.m_templatePath = buffer;
    m_templatePathEdit->setText(QString::fromStdString(m_fields.m_templatePath));
}

void CGUISaveDlg::FillSavePreview()
{
    if (!Commit()) return;
    // A box for each field left would interrupt typing the rows in turn;
    // the problem stands above the preview until the rows are in order, and OK
    // refuses them with a box.
    const int message = m_fields.CheckPreviewRows();
    m_previewProblem->setText(message ? QString::fromStdString(vantrel::LoadMessage(message)) : QString());
    m_previewProblem->setVisible(message != 0);
    if (message) return;
    if (!m_hostSeries) return;
    try {
        PreviewList preview;
        BuildSavePreview(m_fields, *m_hostSeries, preview);
        m_preview = std::move(preview);
    } catch (const std::exception &e) {
        // A host object that fails a call leaves the preview as it was.
        ShowPlain(e.what());
    }
    DrawPreview();
}

void CGUISaveDlg::SetPreviewRow(int row, int firstColumn, int count, const std::vector<std::string> &texts)
{
    vantrel::dialogs::SetPreviewRow(m_preview, row, firstColumn, count, texts);
    DrawPreview();
}

void CGUISaveDlg::DrawPreview()
{
    m_previewList->clear();
    const int columns = int(m_preview.columns.size());
    m_previewList->setColumnCount(columns);
    m_previewList->setRowCount(columns > 0 ? int(m_preview.lines.size()) : 0);
    QStringList headings;
    for (const auto &column : m_preview.columns) headings << QString::fromStdString(column.heading);
    m_previewList->setHorizontalHeaderLabels(headings);
    for (size_t line = 0; line < m_preview.lines.size() && columns > 0; ++line)
        for (size_t column = 0; column < m_preview.lines[line].size() && column < size_t(columns); ++column)
            m_previewList->setItem(int(line), int(column),
                                   new QTableWidgetItem(QString::fromStdString(m_preview.lines[line][column])));
    // Every column gets an equal share of the list's width, less one, and
    // more when its texts need it.
    if (columns > 0) {
        const int width = m_previewList->viewport()->width() / columns - 1;
        m_previewList->resizeColumnsToContents();
        for (int column = 0; column < columns; ++column)
            m_previewList->setColumnWidth(column, std::max({1, width, m_previewList->columnWidth(column)}));
    }
}

bool CGUISaveDlg::CheckFormatLetters(std::string &error) const
{
    if (m_fields.m_multiColumns == 0) return true;
    return CDateTimeUtil::CheckFormatLetters(m_fields.m_format, error);
}

std::optional<std::string> CGUISaveDlg::ChooseFile(bool saveKind, const char *filter, const char *suffix)
{
    QFileDialog chooser(this);
    chooser.setObjectName("fileChooser");
    chooser.setOption(QFileDialog::DontUseNativeDialog);
    chooser.setNameFilter(Text(filter));
    chooser.setDefaultSuffix(Text(suffix));
    chooser.setAcceptMode(saveKind ? QFileDialog::AcceptSave : QFileDialog::AcceptOpen);
    // A save chooser may name a file that isn't there yet: the export creates it.
    chooser.setFileMode(saveKind ? QFileDialog::AnyFile : QFileDialog::ExistingFile);
    chooser.setOption(QFileDialog::DontConfirmOverwrite);
    if (chooser.exec() != QDialog::Accepted || chooser.selectedFiles().isEmpty()) return std::nullopt;
    return chooser.selectedFiles().front().toStdString();
}

void CGUISaveDlg::OnBrowseFile()
{
    try {
        // The engine that is there decides the file kind: a session of the
        // bridge is used, else one is started for this choice alone.
        CExcelObj *session = m_bridge ? CBridgePreviewAccess::Session(*m_bridge) : nullptr;
        std::unique_ptr<CExcelObj> own;
        if (!session) {
            own = std::make_unique<CExcelObj>();
            std::string error;
            if (!own->StartExcel(error)) {
                ShowPlain(error);
                return;
            }
            session = own.get();
        }
        const bool xlsx = session->GetExcelVersion() >= kFirstXlsxVersion;
        const auto path = xlsx ? ChooseFile(true, texts::kNewWorkbookFilter, texts::kNewWorkbookSuffix)
                               : ChooseFile(true, texts::kOldWorkbookFilter, texts::kOldWorkbookSuffix);
        if (path) {
            Commit();
            m_fields.m_filePath = *path;
            Display();
            FillSavePreview();
        }
        if (own) own->QuitExcel();
    } catch (const std::exception &e) {
        ShowPlain(e.what());
    }
}

void CGUISaveDlg::OnBrowseTemplate()
{
    Commit();
    const auto path = ChooseFile(m_fields.m_templateMode == 2, texts::kTemplateFilter, texts::kTemplateSuffix);
    if (!path) return;
    Commit();
    if (m_fields.m_templateMode == 1) {
        if (!LoadTemplateFile(*path)) return;
        m_fields.m_templatePath = *path;
        Display();
        FillSavePreview();
    } else if (m_fields.m_templateMode == 2) {
        m_fields.m_templatePath = *path;
        Display();
    }
}

void CGUISaveDlg::OnOK()
{
    if (!Commit()) return;
    if (const int message = m_fields.CheckHeaderRows()) {
        ShowPlain(vantrel::LoadMessage(message));
        return;
    }
    std::string error;
    if (!CheckFormatLetters(error)) {
        ShowPlain(error);
        return;
    }
    m_fields.m_filePath = Trimmed(m_fields.m_filePath);
    m_filePathEdit->setText(QString::fromStdString(m_fields.m_filePath));
    if (m_fields.m_filePath.empty()) {
        ShowPlain(vantrel::LoadMessage(131), MB_ICONEXCLAMATION);
        return;
    }
    if (!CheckRows(m_fields.ToSaveSpecification())) return;
    if (m_fields.m_templateMode == 1 && PathFileExistsA(m_fields.m_templatePath.c_str()) != 1) {
        MessageBoxA(nullptr, vantrel::LoadMessage(129).c_str(), texts::kWarningCaption, MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    if (m_fields.m_templateMode == 2) {
        m_fields.m_templatePath = Trimmed(m_fields.m_templatePath);
        m_templatePathEdit->setText(QString::fromStdString(m_fields.m_templatePath));
        if (m_fields.m_templatePath.empty()) {
            ShowPlain(vantrel::LoadMessage(132), MB_ICONEXCLAMATION);
            return;
        }
        // A template that can't be written doesn't stop the export.
        WriteTemplateFile(std::string(m_fields.m_templatePath));
    }

    CSpecification specification;
    std::string spec;
    DialogToString(specification, *this, spec);
    if (m_hostSeries) {
        automation::ComPtr<IHostConnection> connection;
        m_hostSeries->GetConnection(connection.Out());
        if (connection) {
            connection->SetSpecification(automation::Bstr(spec).Get());
            connection->SetFilePath(automation::Bstr(m_fields.m_filePath).Get());
        }
    }
    accept();
}

bool CGUISaveDlg::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::FocusOut && LeavesByUser(static_cast<QFocusEvent *>(event))) {
        if (watched == m_templatePathEdit) {
            OnTemplatePathLeft();
        } else {
            for (CNumberField *field : {m_dateTimeColumn, m_unitTypeRow, m_valueTypeRow, m_dataStartRow, m_unitRow,
                                        m_itemDescriptionRow, m_deleteValueRow})
                if (watched == field->Edit()) OnNumberFieldLeft();
        }
    }
    return QDialog::eventFilter(watched, event);
}

void CGUISaveDlg::resizeEvent(QResizeEvent *event)
{
    QDialog::resizeEvent(event);
    DrawPreview();
}
