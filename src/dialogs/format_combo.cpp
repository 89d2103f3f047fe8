// SPDX-License-Identifier: MIT
#include "dialogs/format_combo.h"

#include <vector>

#include <QFocusEvent>

#include "datetime/format_presets.h"
#include "dialogs/sorted_entries.h"

using vantrel::dialogs::FindExactEntry;
using vantrel::dialogs::SortedInsertPlace;

namespace {

std::vector<std::string> Entries(const QComboBox &combo)
{
    std::vector<std::string> entries;
    for (int i = 0; i < combo.count(); ++i) entries.push_back(combo.itemText(i).toStdString());
    return entries;
}

}  // namespace

CDTFormatCMB::CDTFormatCMB(QWidget *parent) : QComboBox(parent)
{
    setEditable(true);
    // The control keeps its own order; typing adds nothing until focus leaves.
    setInsertPolicy(QComboBox::NoInsert);
    // What the user types stays as typed: no inline completion to a preset.
    setCompleter(nullptr);
    setMinimumContentsLength(20);
}

void CDTFormatCMB::FillPresets(int kind)
{
    for (const std::string &preset : vantrel::datetime::FormatPresets(kind)) InsertSorted(preset);
}

void CDTFormatCMB::AddIfMissing(const std::string &text)
{
    if (FindExactEntry(Entries(*this), text) < 0) InsertSorted(text);
}

void CDTFormatCMB::InsertSorted(const std::string &text)
{
    // Inserting must not change what the edit field shows.
    const QString shown = currentText();
    insertItem(int(SortedInsertPlace(Entries(*this), text)), QString::fromStdString(text));
    setEditText(shown);
}

void CDTFormatCMB::focusOutEvent(QFocusEvent *event)
{
    QComboBox::focusOutEvent(event);
    if (event->reason() != Qt::PopupFocusReason) emit focusLeft();
}
