// SPDX-License-Identifier: MIT
// The save dialog's preview: what the export would put on the sheet for the
// first time steps, read from the host object alone (no workbook, no
// session). One list line a sheet row and one list column a sheet column,
// both from 1.
#pragma once

#include <string>
#include <vector>

#include "dialogs/preview_reader.h"
#include "dialogs/save_dialog_fields.h"
#include "hostseries/hostseries.h"

namespace vantrel::dialogs {

// The preview shows at most this many time steps.
inline constexpr int kSavePreviewSteps = 10;

// Puts count texts (fewer if texts has fewer) into the line of sheet row
// row, from the list column firstColumn (0-based). Places that the list
// doesn't have (a line or column before the first, or past the last) are
// passed over.
void SetPreviewRow(PreviewList &list, int row, int firstColumn, int count, const std::vector<std::string> &texts);

// Lays the host object out in list by the committed fields, whose rows have
// passed CheckPreviewRows. A layout with no column at all leaves the list
// empty. Host calls that fail raise automation::ComError.
void BuildSavePreview(const SaveDialogFields &fields, IHostSeries &series, PreviewList &list);

// The text of one value as the preview shows it: empty when it is the delete
// value and no delete value row is written; else "%g" or "%d" by the item's
// data type, with a decimal point in every locale. Types outside 1, 2, 4 to 7
// give no text (false).
bool PreviewValueText(ItemDataType type, double element, double deleteValue, bool deleteRowWritten,
                      std::string &text);

}  // namespace vantrel::dialogs
