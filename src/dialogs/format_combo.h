// SPDX-License-Identifier: MIT
// CDTFormatCMB: the combo box in which a date/time format is picked or typed.
// Its list is sorted and holds the presets of one kind and whatever formats
// the user typed while the dialog lasts. What counts is the text of its edit
// field; no index into the list is used.
#pragma once

#include <string>

#include <QComboBox>

class CDTFormatCMB : public QComboBox {
    Q_OBJECT
public:
    explicit CDTFormatCMB(QWidget *parent = nullptr);

    // Adds the presets of a kind (0 date and time, 1 date, 2 time), without
    // clearing the list.
    void FillPresets(int kind);
    // Adds text unless an entry equals it, ignoring case.
    void AddIfMissing(const std::string &text);

signals:
    // The keyboard focus left the control (not for its own drop-down).
    void focusLeft();

protected:
    void focusOutEvent(QFocusEvent *event) override;

private:
    void InsertSorted(const std::string &text);
};
