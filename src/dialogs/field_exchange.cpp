// SPDX-License-Identifier: MIT
#include "dialogs/field_exchange.h"

#include <cmath>

#include "dialogs/field_parsing.h"
#include "dialogs/sorted_entries.h"
#include "module/string_table.h"
#include "shell/shell.h"

namespace vantrel::dialogs {
namespace {

const QDate kSerialOrigin(1899, 12, 30);
constexpr double kSecondsPerDay = 86400.0;

std::string WithoutColon(std::string label)
{
    while (!label.empty() && (label.back() == ':' || label.back() == ' ')) label.pop_back();
    return label;
}

std::vector<std::string> Entries(const QComboBox *list)
{
    std::vector<std::string> entries;
    for (int i = 0; i < list->count(); ++i) entries.push_back(list->itemText(i).toStdString());
    return entries;
}

}  // namespace

QDateTime DateTimeOfSerial(double serial)
{
    // The whole days count from the origin; the fraction is the time of day
    // on either side of it.
    const double days = std::trunc(serial);
    const long long seconds = std::llround(std::fabs(serial - days) * kSecondsPerDay);
    QDateTime result(kSerialOrigin.addDays(static_cast<qint64>(days)), QTime(0, 0), Qt::UTC);
    return result.addSecs(seconds);
}

double SerialOfDateTime(const QDateTime &dateTime)
{
    const double days = double(kSerialOrigin.daysTo(dateTime.date()));
    const double fraction = QTime(0, 0).secsTo(dateTime.time()) / kSecondsPerDay;
    return days < 0 ? days - fraction : days + fraction;
}

void CFieldExchange::Refuse(QLineEdit *edit, int message, const std::string &label)
{
    m_failed = true;
    const std::string text = FormatMessage(message, WithoutColon(label).c_str());
    MessageBoxA(nullptr, text.c_str(), LoadMessage(kStringApplicationTitle).c_str(), MB_OK | MB_ICONEXCLAMATION);
    edit->setFocus(Qt::OtherFocusReason);
    edit->selectAll();
}

void CFieldExchange::Text(QLineEdit *edit, std::string &field)
{
    if (m_failed) return;
    if (m_commit) field = edit->text().toStdString();
    else edit->setText(QString::fromStdString(field));
}

void CFieldExchange::EditText(QComboBox *combo, std::string &field)
{
    if (m_failed) return;
    if (m_commit) field = combo->currentText().toStdString();
    else combo->setEditText(QString::fromStdString(field));
}

void CFieldExchange::WholeNumber(QLineEdit *edit, int &field, const std::string &label)
{
    if (m_failed) return;
    if (!m_commit) {
        edit->setText(QString::fromStdString(WholeNumberText(field)));
        return;
    }
    if (!ParseWholeNumber(edit->text().toStdString(), field)) Refuse(edit, 146, label);
}

void CFieldExchange::Number(QLineEdit *edit, double &field, const std::string &label)
{
    if (m_failed) return;
    if (!m_commit) {
        edit->setText(QString::fromStdString(NumberText(field)));
        return;
    }
    if (!ParseNumber(edit->text().toStdString(), field)) Refuse(edit, 147, label);
}

void CFieldExchange::Check(QAbstractButton *box, int &field)
{
    if (m_failed) return;
    if (m_commit) field = box->isChecked() ? 1 : 0;
    else box->setChecked(field == 1);
}

void CFieldExchange::Radio(const std::vector<QAbstractButton *> &group, int &field)
{
    if (m_failed) return;
    if (m_commit) {
        field = -1;
        for (size_t i = 0; i < group.size(); ++i)
            if (group[i]->isChecked()) field = int(i);
        return;
    }
    if (field >= 0 && size_t(field) < group.size()) group[size_t(field)]->setChecked(true);
}

void CFieldExchange::ListChoice(QComboBox *list, std::string &field)
{
    if (m_failed) return;
    if (m_commit) {
        field = list->currentIndex() < 0 ? std::string() : list->currentText().toStdString();
        return;
    }
    if (field.empty()) return;
    const int found = FindPrefixEntry(Entries(list), field);
    if (found >= 0) list->setCurrentIndex(found);
}

void CFieldExchange::DatePart(QDateTimeEdit *picker, DateValue &field)
{
    if (m_failed) return;
    const QDateTime current = DateTimeOfSerial(field.serial);
    if (m_commit) {
        field.serial = SerialOfDateTime(QDateTime(picker->date(), current.time(), Qt::UTC));
        field.status = kDateValid;
    } else {
        picker->setDate(current.date());
    }
}

void CFieldExchange::TimePart(QDateTimeEdit *picker, DateValue &field)
{
    if (m_failed) return;
    const QDateTime current = DateTimeOfSerial(field.serial);
    if (m_commit) {
        field.serial = SerialOfDateTime(QDateTime(current.date(), picker->time(), Qt::UTC));
        field.status = kDateValid;
    } else {
        picker->setTime(current.time());
    }
}

}  // namespace vantrel::dialogs
