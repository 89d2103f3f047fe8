// SPDX-License-Identifier: MIT
#include "dialogs/open_dialog.h"

#include <cstring>
#include <vector>

#include <QFileDialog>
#include <QFocusEvent>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QVBoxLayout>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "dialogs/dialog_texts.h"
#include "dialogs/field_exchange.h"
#include "dialogs/tab_order.h"
#include "module/string_table.h"
#include "shell/shell.h"
#include "specification/specification.h"

using namespace vantrel::dialogs;

namespace {

// The sheet list of the sheets field is parsed against this many sheets; the
// workbook's own count is checked by the preview and the inspection.
constexpr int kSheetBound = 10;
constexpr int kPreviewTab = 2;

QString Text(const char *text) { return QString::fromUtf8(text); }

bool LeavesByUser(const QFocusEvent *event)
{
    // Another window coming up (a box, a chooser) or a drop-down is no leaving.
    return event->reason() != Qt::ActiveWindowFocusReason && event->reason() != Qt::PopupFocusReason;
}

}  // namespace

CGUIOpenDlg::CGUIOpenDlg(QWidget *parent)
    : QDialog(parent),
      m_filePathEdit(new QLineEdit(this)),
      m_browseFile(new QPushButton(Text(texts::kBrowse), this)),
      m_noTemplate(new QRadioButton(Text(texts::kNoTemplate), this)),
      m_useTemplate(new QRadioButton(Text(texts::kUseTemplate), this)),
      m_saveTemplate(new QRadioButton(Text(texts::kSaveTemplate), this)),
      m_templatePathEdit(new QLineEdit(this)),
      m_browseTemplate(new QPushButton(Text(texts::kBrowse), this)),
      m_sheetsEdit(new QLineEdit(this)),
      m_tabSheet(new CTabSheet(this)),
      m_timePage(nullptr),
      m_dataPage(nullptr),
      m_previewPage(nullptr),
      m_ok(new QPushButton(Text(texts::kOk), this)),
      m_cancel(new QPushButton(Text(texts::kCancel), this))
{
    setWindowTitle(Text(texts::kOpenTitle));
    setObjectName("openDialog");
    m_filePathEdit->setObjectName("filePath");
    m_browseFile->setObjectName("browseFile");
    m_noTemplate->setObjectName("noTemplate");
    m_useTemplate->setObjectName("useTemplate");
    m_saveTemplate->setObjectName("saveTemplate");
    m_templatePathEdit->setObjectName("templatePath");
    m_browseTemplate->setObjectName("browseTemplate");
    m_sheetsEdit->setObjectName("excelSheets");
    m_tabSheet->setObjectName("tabSheet");
    m_ok->setObjectName("ok");
    m_cancel->setObjectName("cancel");
    for (QPushButton *browse : {m_browseFile, m_browseTemplate}) browse->setFixedWidth(32);
    m_ok->setDefault(true);
    m_ok->setAutoDefault(true);
    m_cancel->setAutoDefault(false);

    auto *outer = new QVBoxLayout(this);
    auto *file = new QHBoxLayout;
    file->addWidget(new QLabel(Text(texts::kFilePath), this));
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
    templateGrid->addWidget(new QLabel(Text(texts::kFilePath), templates), 1, 0);
    templateGrid->addWidget(m_templatePathEdit, 1, 1);
    templateGrid->addWidget(m_browseTemplate, 1, 2);
    outer->addWidget(templates);

    auto *sheets = new QHBoxLayout;
    sheets->addWidget(new QLabel(Text(texts::kExcelSheets), this));
    m_sheetsEdit->setMaximumWidth(120);
    sheets->addWidget(m_sheetsEdit);
    auto *hint = new QLabel(Text(texts::kSheetsHint), this);
    hint->setObjectName("sheetsHint");
    sheets->addWidget(hint, 1);
    outer->addLayout(sheets);

    outer->addWidget(m_tabSheet, 1);
    auto *buttons = new QHBoxLayout;
    buttons->addStretch(1);
    buttons->addWidget(m_ok);
    buttons->addWidget(m_cancel);
    outer->addLayout(buttons);

    connect(m_ok, &QPushButton::clicked, this, &CGUIOpenDlg::OnOK);
    connect(m_cancel, &QPushButton::clicked, this, &QDialog::reject);
    connect(m_browseFile, &QPushButton::clicked, this, &CGUIOpenDlg::OnBrowseFile);
    connect(m_browseTemplate, &QPushButton::clicked, this, &CGUIOpenDlg::OnBrowseTemplate);
    connect(m_noTemplate, &QRadioButton::clicked, this, [this] { OnTemplateRadio(0); });
    connect(m_useTemplate, &QRadioButton::clicked, this, [this] { OnTemplateRadio(1); });
    connect(m_saveTemplate, &QRadioButton::clicked, this, [this] { OnTemplateRadio(2); });
    for (QLineEdit *edit : {m_filePathEdit, m_templatePathEdit, m_sheetsEdit}) edit->installEventFilter(this);

    OnInitDialog();
}

void CGUIOpenDlg::OnInitDialog()
{
    EnableTemplatePath(m_fields.m_templateMode != 0);
    m_timePage = new CTimePageDlg(m_tabSheet);
    m_dataPage = new CDataPageDlg(m_tabSheet);
    m_previewPage = new COpenPreviewPageDlg(m_tabSheet);
    m_timePage->OnInitDialog();
    m_dataPage->OnInitDialog();
    m_previewPage->OnInitDialog();
    m_tabSheet->AddPage(Text(texts::kTimePageTitle), m_timePage);
    m_tabSheet->AddPage(Text(texts::kDataPageTitle), m_dataPage);
    m_tabSheet->AddPage(Text(texts::kPreviewPageTitle), m_previewPage);
    m_tabSheet->ShowPages();
    m_previewPage->SetOwner(this);
    std::vector<QWidget *> order = {m_filePathEdit, m_browseFile,       m_noTemplate, m_useTemplate,
                                    m_saveTemplate, m_templatePathEdit, m_browseTemplate, m_sheetsEdit};
    for (const auto &page : {m_timePage->ReadingOrder(), m_dataPage->ReadingOrder()})
        order.insert(order.end(), page.begin(), page.end());
    order.insert(order.end(), {m_previewPage->SheetListControl(), m_previewPage->ResultListControl(), m_ok, m_cancel});
    ChainTabOrder(order);
    Display();
}

void CGUIOpenDlg::SetHost(IHostSeries *hostSeries, CExcelVantrel *bridge)
{
    m_hostSeries = hostSeries;
    m_bridge = bridge;
}

bool CGUIOpenDlg::GetDialogKeyValue(int key, std::string &value) const
{
    return COpenDialogKeys(m_fields, m_timePage->Fields(), m_dataPage->Fields()).GetDialogKeyValue(key, value);
}

void CGUIOpenDlg::Exchange(bool commit)
{
    CFieldExchange exchange(commit ? vantrel::dialogs::Exchange::Commit : vantrel::dialogs::Exchange::Display);
    exchange.Text(m_filePathEdit, m_fields.m_filePath);
    exchange.Radio({m_noTemplate, m_useTemplate, m_saveTemplate}, m_fields.m_templateMode);
    exchange.Text(m_templatePathEdit, m_fields.m_templatePath);
    exchange.Text(m_sheetsEdit, m_fields.m_excelSheets);
}

bool CGUIOpenDlg::Commit()
{
    Exchange(true);
    return true;
}

void CGUIOpenDlg::Display() { Exchange(false); }

void CGUIOpenDlg::EnableTemplatePath(bool enabled)
{
    m_templatePathEdit->setEnabled(enabled);
    m_browseTemplate->setEnabled(enabled);
}

void CGUIOpenDlg::OnTemplateRadio(int mode)
{
    EnableTemplatePath(mode != 0);
    Commit();
}

void CGUIOpenDlg::Warn(int message)
{
    MessageBoxA(nullptr, vantrel::LoadMessage(message).c_str(), texts::kWarningCaption, MB_OK | MB_ICONEXCLAMATION);
}

std::optional<std::string> CGUIOpenDlg::ChooseFile(bool saveKind, const char *filter, const char *suffix)
{
    QFileDialog chooser(this);
    chooser.setObjectName("fileChooser");
    chooser.setOption(QFileDialog::DontUseNativeDialog);
    chooser.setNameFilter(Text(filter));
    chooser.setDefaultSuffix(Text(suffix));
    chooser.setAcceptMode(saveKind ? QFileDialog::AcceptSave : QFileDialog::AcceptOpen);
    chooser.setFileMode(saveKind ? QFileDialog::AnyFile : QFileDialog::ExistingFile);
    if (chooser.exec() != QDialog::Accepted || chooser.selectedFiles().isEmpty()) return std::nullopt;
    return chooser.selectedFiles().front().toStdString();
}

void CGUIOpenDlg::OnBrowseFile()
{
    Commit();
    const auto path = ChooseFile(false, texts::kWorkbookFilter, texts::kWorkbookSuffix);
    if (!path) return;
    m_fields.m_filePath = *path;
    Display();
    m_timePage->Commit();
    m_dataPage->Commit();
    RefreshPreviewSource();
    if (m_tabSheet->CurrentPage() == kPreviewTab) m_previewPage->RefreshPreview();
}

void CGUIOpenDlg::OnBrowseTemplate()
{
    const bool saveKind = m_fields.m_templateMode == 2;
    Commit();
    const auto path = ChooseFile(saveKind, texts::kTemplateFilter, texts::kTemplateSuffix);
    if (!path) return;
    if (m_fields.m_templateMode == 1) {
        if (!LoadTemplateFile(*path)) return;
        m_fields.m_templatePath = *path;
        Display();
    } else if (m_fields.m_templateMode == 2) {
        m_fields.m_templatePath = *path;
        Display();
    }
}

void CGUIOpenDlg::OnTemplatePathLeft()
{
    Commit();
    if (m_fields.m_templateMode != 2) return;
    // A path without any extension gets ".xml".
    char buffer[MAX_PATH] = {};
    std::strncpy(buffer, m_fields.m_templatePath.c_str(), MAX_PATH - 1);
    PathAddExtensionA(buffer, ".xml");
    m_fields.m_templatePath = buffer;
    m_templatePathEdit->setText(QString::fromStdString(m_fields.m_templatePath));
}

void CGUIOpenDlg::OnSheetsLeft()
{
    if (m_tabSheet->CurrentPage() == kPreviewTab) RefreshFromPreviewPage();
    else RefreshPreviewSource();
}

bool CGUIOpenDlg::RefreshPreviewSource()
{
    // The path and sheets as the person typed them, whether or not a field was left.
    Commit();
    std::vector<int32_t> sheets;
    CSpecification specification;
    specification.ParseSheetList(m_sheetsEdit->text().toStdString(), kSheetBound, sheets);
    std::string spec;
    DialogToString(specification, *this, spec);
    if (!m_hostSeries || !m_bridge) return true;

    automation::ComPtr<IHostConnection> connection;
    m_hostSeries->GetConnection(connection.Out());
    std::string path;
    if (connection) {
        connection->SetSpecification(automation::Bstr(spec).Get());
        CSpecification().GetKeyValue(spec, FilePath, path);
        connection->SetFilePath(automation::Bstr(path).Get());
    }
    m_previewPage->SetPreviewSource(*m_bridge, spec);
    if (sheets.empty()) {
        const std::string text = vantrel::FormatMessage(145, m_sheetsEdit->text().toStdString().c_str());
        MessageBoxA(nullptr, text.c_str(), vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK);
        return false;
    }
    m_previewPage->SetPreviewFile(path, sheets.front(), this);
    return true;
}

void CGUIOpenDlg::RefreshFromPreviewPage()
{
    if (!m_timePage->Commit() || !m_dataPage->Commit()) return;
    // No workbook named yet: nothing to show, and nothing to complain about.
    if (RefreshPreviewSource() && !m_fields.m_filePath.empty()) m_previewPage->RefreshPreview();
}

void CGUIOpenDlg::OnOK()
{
    // A refused value keeps the dialog open, on the page that shows it.
    if (!m_timePage->Commit()) {
        m_tabSheet->SelectPage(0);
        return;
    }
    if (!m_dataPage->Commit()) {
        m_tabSheet->SelectPage(1);
        return;
    }
    Commit();
    if (!m_dataPage->CheckDataRows()) return;
    if (PathFileExistsA(m_fields.m_filePath.c_str()) != 1) {
        Warn(139);
        return;
    }
    if (m_fields.m_templateMode == 1 && PathFileExistsA(m_fields.m_templatePath.c_str()) != 1) {
        Warn(129);
        return;
    }
    if (m_fields.m_templateMode == 2) {
        if (m_fields.m_templatePath.empty()) {
            MessageBoxA(nullptr, vantrel::LoadMessage(130).c_str(),
                        vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK | MB_ICONEXCLAMATION);
            return;
        }
        // A template that can't be written doesn't stop the import.
        WriteTemplateFile(std::string(m_fields.m_templatePath));
    }

    CSpecification specification;
    std::string spec;
    DialogToString(specification, *this, spec);
    if (!m_hostSeries || !m_bridge) return;
    automation::ComPtr<IHostConnection> connection;
    m_hostSeries->GetConnection(connection.Out());
    if (!connection) return;
    connection->SetSpecification(automation::Bstr(spec).Get());
    connection->SetFilePath(automation::Bstr(m_fields.m_filePath).Get());
    connection.Reset();

    SHORT fits = 0;
    if (m_bridge->InspectWorkbook(&fits) == S_OK && fits == SHORT(VARIANT_TRUE)) accept();
}

void CGUIOpenDlg::done(int result)
{
    // The pages don't commit while their parent goes away.
    m_timePage->SetParentClosing(true);
    m_dataPage->SetParentClosing(true);
    QDialog::done(result);
}

bool CGUIOpenDlg::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::FocusOut && LeavesByUser(static_cast<QFocusEvent *>(event))) {
        if (watched == m_templatePathEdit) OnTemplatePathLeft();
        else if (watched == m_filePathEdit) RefreshPreviewSource();
        else if (watched == m_sheetsEdit) OnSheetsLeft();
    }
    return QDialog::eventFilter(watched, event);
}
