// SPDX-License-Identifier: MIT
// The field exchange of a dialog or page: one pass over its controls that
// either commits (controls into fields) or displays (fields into controls).
// A commit that meets a number field without a number shows why, puts the
// focus there and leaves that field and all after it as they were.
#pragma once

#include <string>
#include <vector>

#include <QAbstractButton>
#include <QComboBox>
#include <QDateTimeEdit>
#include <QLineEdit>

#include "datetime/date_value.h"

namespace vantrel::dialogs {

enum class Exchange { Commit, Display };

class CFieldExchange {
public:
    explicit CFieldExchange(Exchange direction) : m_commit(direction == Exchange::Commit) {}
    bool Committing() const { return m_commit; }
    // False once a field refused its text.
    bool Succeeded() const { return !m_failed; }

    void Text(QLineEdit *edit, std::string &field);
    // The edit text of an editable combo.
    void EditText(QComboBox *combo, std::string &field);
    // label names the field in the message of a refused commit.
    void WholeNumber(QLineEdit *edit, int &field, const std::string &label);
    void Number(QLineEdit *edit, double &field, const std::string &label);
    void Check(QAbstractButton *box, int &field);
    // The index of the checked radio of the group, -1 when none is.
    void Radio(const std::vector<QAbstractButton *> &group, int &field);
    // A drop-down list: commit takes the selected entry's text; display
    // selects the first entry that begins with the field, ignoring case, and
    // leaves the selection alone for an empty field or no match.
    void ListChoice(QComboBox *list, std::string &field);
    // A date picker moves the date of the field, a time picker its time of day.
    void DatePart(QDateTimeEdit *picker, DateValue &field);
    void TimePart(QDateTimeEdit *picker, DateValue &field);

private:
    void Refuse(QLineEdit *edit, int message, const std::string &label);

    bool m_commit;
    bool m_failed = false;
};

// Date serials and Qt's dates: days since 30 December 1899, the time of day
// as the fraction.
QDateTime DateTimeOfSerial(double serial);
double SerialOfDateTime(const QDateTime &dateTime);

}  // namespace vantrel::dialogs
