// SPDX-License-Identifier: MIT
// CTabSheet: the tab control of the open dialog. It holds up to 16 pages,
// places them in its display area below the tabs and shows one at a time.
// A page changes when the left mouse button goes down on another tab.
#pragma once

#include <array>

#include <QString>
#include <QTabBar>
#include <QWheelEvent>
#include <QWidget>

class CTabSheetBar : public QTabBar {
    Q_OBJECT
public:
    using QTabBar::QTabBar;

signals:
    // After the bar's own handling of a left button press.
    void leftButtonPressed();

protected:
    void mousePressEvent(QMouseEvent *event) override;
    // The wheel would mark another tab while its page stays hidden.
    void wheelEvent(QWheelEvent *event) override { event->ignore(); }
};

class CTabSheet : public QWidget {
    Q_OBJECT
public:
    static constexpr int kPageLimit = 16;

    explicit CTabSheet(QWidget *parent = nullptr);

    // False with a full table of pages; else appends the page and gives true.
    bool AddPage(const QString &title, QWidget *page);
    // Inserts the tabs in order, shows page 0, hides the others, lays them out.
    void ShowPages();
    // Places every page in the display area below the tabs.
    void LayoutPages();
    // Shows the page at index and marks its tab, as a click on the tab does.
    void SelectPage(int index);

    int PageCount() const { return m_pageCount; }
    int CurrentPage() const { return m_currentPage; }
    QWidget *Page(int index) const;
    CTabSheetBar *Bar() const { return m_bar; }

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

protected:
    void resizeEvent(QResizeEvent *event) override;

private:
    void OnLeftButtonDown();
    QRect DisplayArea() const;

    CTabSheetBar *m_bar;
    int m_pageCount = 0;
    std::array<QString, kPageLimit> m_titles;
    std::array<QWidget *, kPageLimit> m_pages{};
    int m_currentPage = 0;
};
