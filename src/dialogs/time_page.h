// SPDX-License-Identifier: MIT
// CTimePageDlg: the page "Time description" of the open dialog, on which the
// user says where the time of a row stands. Three layouts, one radio each;
// the fields live in TimePageFields, the page moves them in and out.
#pragma once

#include <array>
#include <string>
#include <vector>

#include <QCheckBox>
#include <QDateEdit>
#include <QRadioButton>
#include <QTimeEdit>
#include <QWidget>

#include "dialogs/format_combo.h"
#include "dialogs/number_field.h"
#include "dialogs/time_page_fields.h"

class CTimePageDlg : public QWidget {
    Q_OBJECT
public:
    explicit CTimePageDlg(QWidget *parent = nullptr);

    // Dates to now, the first radio, the spins, the enabled states, a
    // display, then the presets of the three combos.
    void OnInitDialog();
    // Controls into fields; false when a field refused its text.
    bool Commit();
    // The page's controls from top to bottom, for the Tab key.
    std::vector<QWidget *> ReadingOrder() const;
    // Fields into controls.
    void Display();

    const vantrel::dialogs::TimePageFields &Fields() const { return m_fields; }
    // The keys of the page out of its committed fields.
    bool GetKeyValue(int key, std::string &value) const { return m_fields.GetKeyValue(key, value); }

    // Setters for a loaded template: each stores and displays.
    void SetDateCol(int column);
    void SetDateFormat(const std::string &format);
    void SetDateTimeCol(int column);
    void SetDateTimeFormat(const std::string &format);
    void SetGlobalDate(const DateValue &date);
    void SetGlobalTime(const DateValue &time);
    void SetTimeCol(int column);
    void SetTimeFormat(const std::string &format);
    // Stores the mode, displays, and enables the controls of that layout only.
    void SetTimeMode(int mode);
    void SetUseDTFormat(int use);
    void SetUseDFormat(int use);
    void SetUseTFormat(int use);

    // The parent is closing: a hide then doesn't commit.
    void SetParentClosing(bool closing) { m_parentClosing = closing; }

protected:
    void hideEvent(QHideEvent *event) override;
    void showEvent(QShowEvent *event) override;
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    // The controls of one layout.
    struct Layout {
        QRadioButton *radio = nullptr;
        CNumberField *column = nullptr;
        QCheckBox *box = nullptr;
        CDTFormatCMB *combo = nullptr;
        QWidget *picker = nullptr;  // none for layout 0
    };
    void Exchange(bool commit);
    // Enables the layout of mode, its combo following its box, and disables the others.
    void EnableLayouts(int mode);
    void OnBoxClicked(int layout);
    void OnComboLeft(int layout);

    vantrel::dialogs::TimePageFields m_fields;
    std::array<Layout, 3> m_layouts;
    QDateEdit *m_datePicker;
    QTimeEdit *m_timePicker;
    bool m_parentClosing = false;
    bool m_lastExchangeOk = true;
};
