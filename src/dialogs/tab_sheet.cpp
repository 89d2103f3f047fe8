// SPDX-License-Identifier: MIT
#include "dialogs/tab_sheet.h"

#include <QMouseEvent>

namespace {
constexpr int kFrame = 6;
}

void CTabSheetBar::mousePressEvent(QMouseEvent *event)
{
    QTabBar::mousePressEvent(event);
    if (event->button() == Qt::LeftButton) emit leftButtonPressed();
}

CTabSheet::CTabSheet(QWidget *parent) : QWidget(parent), m_bar(new CTabSheetBar(this))
{
    // Tabs change with the mouse only, so the bar never shows a tab whose page isn't up.
    m_bar->setFocusPolicy(Qt::NoFocus);
    m_bar->setDrawBase(true);
    connect(m_bar, &CTabSheetBar::leftButtonPressed, this, &CTabSheet::OnLeftButtonDown);
}

bool CTabSheet::AddPage(const QString &title, QWidget *page)
{
    if (m_pageCount >= kPageLimit) return false;
    m_titles[size_t(m_pageCount)] = title;
    m_pages[size_t(m_pageCount)] = page;
    ++m_pageCount;
    return true;
}

QWidget *CTabSheet::Page(int index) const
{
    return index >= 0 && index < m_pageCount ? m_pages[size_t(index)] : nullptr;
}

void CTabSheet::ShowPages()
{
    for (int i = 0; i < m_pageCount; ++i) m_bar->insertTab(i, m_titles[size_t(i)]);
    m_currentPage = 0;
    m_bar->setCurrentIndex(0);
    for (int i = 0; i < m_pageCount; ++i) m_pages[size_t(i)]->setVisible(i == 0);
    LayoutPages();
}

QRect CTabSheet::DisplayArea() const
{
    const int top = m_bar->sizeHint().height();
    return QRect(kFrame, top + kFrame, width() - 2 * kFrame, height() - top - 2 * kFrame);
}

void CTabSheet::LayoutPages()
{
    m_bar->setGeometry(0, 0, width(), m_bar->sizeHint().height());
    const QRect area = DisplayArea();
    for (int i = 0; i < m_pageCount; ++i) m_pages[size_t(i)]->setGeometry(area);
}

QSize CTabSheet::sizeHint() const
{
    QSize pages(0, 0);
    for (int i = 0; i < m_pageCount; ++i) pages = pages.expandedTo(m_pages[size_t(i)]->sizeHint());
    const QSize bar = m_bar->sizeHint();
    return QSize(std::max(bar.width(), pages.width()) + 2 * kFrame, bar.height() + pages.height() + 2 * kFrame);
}

QSize CTabSheet::minimumSizeHint() const { return sizeHint(); }

void CTabSheet::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    LayoutPages();
}

void CTabSheet::OnLeftButtonDown() { SelectPage(m_bar->currentIndex()); }

void CTabSheet::SelectPage(int chosen)
{
    if (chosen == m_currentPage || chosen < 0 || chosen >= m_pageCount) return;
    m_bar->setCurrentIndex(chosen);
    m_pages[size_t(m_currentPage)]->hide();
    m_currentPage = chosen;
    QWidget *page = m_pages[size_t(m_currentPage)];
    page->setFocus(Qt::MouseFocusReason);
    page->show();
}
