// SPDX-License-Identifier: MIT
#include "dialogs/preview_page.h"

#include <exception>

#include <QHeaderView>
#include <QVBoxLayout>

#include "dialogs/open_dialog.h"
#include "module/string_table.h"
#include "shell/shell.h"

using vantrel::dialogs::PreviewList;

namespace {

QTableWidget *ListControl(const char *name, QWidget *parent)
{
    auto *list = new QTableWidget(parent);
    list->setObjectName(name);
    list->verticalHeader()->hide();
    list->setEditTriggers(QAbstractItemView::NoEditTriggers);
    list->horizontalHeader()->setHighlightSections(false);
    list->setWordWrap(false);
    // Tab leaves the list for the next control rather than walking its cells.
    list->setTabKeyNavigation(false);
    return list;
}

}  // namespace

COpenPreviewPageDlg::COpenPreviewPageDlg(QWidget *parent)
    : QWidget(parent), m_sheetList(ListControl("sheetList", this)), m_resultList(ListControl("resultList", this))
{
    setObjectName("previewPage");
    auto *layout = new QVBoxLayout(this);
    layout->addWidget(m_sheetList);
    layout->addWidget(m_resultList);
    m_resultList->setShowGrid(false);
}

void COpenPreviewPageDlg::OnInitDialog()
{
    // The upper list: grid lines, whole rows selected.
    m_sheetList->setShowGrid(true);
    m_sheetList->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_resultList->setSelectionBehavior(QAbstractItemView::SelectRows);
}

void COpenPreviewPageDlg::SetPreviewSource(CExcelVantrel &bridge, const std::string &specification)
{
    m_preview.SetPreviewSource(bridge, specification);
}

void COpenPreviewPageDlg::SetPreviewFile(const std::string &path, int32_t sheet, CGUIOpenDlg *owner)
{
    m_owner = owner;
    m_preview.SetPreviewFile(path, sheet);
}

bool COpenPreviewPageDlg::RefreshPreview()
{
    bool filled = false;
    try {
        filled = m_preview.RefreshPreview();
    } catch (const std::exception &e) {
        // A fault of the workbook layer ends the refresh; the dialog stays.
        MessageBoxA(nullptr, e.what(), vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK);
    }
    Draw(m_sheetList, m_preview.SheetList());
    Draw(m_resultList, m_preview.ResultList());
    return filled;
}

void COpenPreviewPageDlg::Draw(QTableWidget *control, const PreviewList &list)
{
    control->clear();
    control->setColumnCount(int(list.columns.size()));
    control->setRowCount(int(list.lines.size()));
    QStringList headings;
    for (const auto &column : list.columns) headings << QString::fromStdString(column.heading);
    control->setHorizontalHeaderLabels(headings);
    for (size_t line = 0; line < list.lines.size(); ++line)
        for (size_t column = 0; column < list.lines[line].size() && column < list.columns.size(); ++column)
            control->setItem(int(line), int(column),
                             new QTableWidgetItem(QString::fromStdString(list.lines[line][column])));
    const int width = control->viewport()->width();
    for (size_t column = 0; column < list.columns.size(); ++column)
        control->setColumnWidth(int(column), std::max(20, int(width * list.columns[column].widthShare)));
}

void COpenPreviewPageDlg::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    if (m_owner) m_owner->RefreshFromPreviewPage();
}

void COpenPreviewPageDlg::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    Draw(m_sheetList, m_preview.SheetList());
    Draw(m_resultList, m_preview.ResultList());
}
