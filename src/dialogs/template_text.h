// SPDX-License-Identifier: MIT
// The text of a template file as the dialogs write it: a header line, the
// root element with the schema instance namespace, all attributes of the
// dialog's kind on one line in a fixed order, and "/>" with no line end.
//
// Attribute values are UTF-8, the system's own text, so the file's header
// tells the truth; "&", "<", ">", double quotes, tabs and line ends are
// written as references, and what XML can't hold at all (bytes that are no
// UTF-8, other control characters) as U+FFFD. Plain ASCII without those
// characters stands in the file as it is.
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "dialogs/data_page_fields.h"
#include "dialogs/open_dialog_fields.h"
#include "dialogs/time_page_fields.h"

namespace vantrel::dialogs {

struct SaveDialogFields;

// One attribute: its name and its value as it shall read back.
using TemplateAttribute = std::pair<std::string, std::string>;

// The value escaped for a double-quoted attribute.
std::string EscapeAttributeValue(const std::string &value);

// The whole file text for these attributes, in the order given.
std::string ComposeTemplateText(const std::vector<TemplateAttribute> &attributes);

// "true" for 1, "false" for anything else.
std::string FlagText(int flag);

// The open writer's rule for a format that begins with a double quote: the
// double quotes at both ends become single quotes, so the readers can tell it.
std::string OpenTemplateFormat(const std::string &format);

// The 28 attributes of an open template, from the open dialog's fields.
std::vector<TemplateAttribute> OpenTemplateAttributes(const OpenDialogFields &dialog, const TimePageFields &time,
                                                      const DataPageFields &data);
// The 10 attributes of a save template, from the save dialog's fields.
std::vector<TemplateAttribute> SaveTemplateAttributes(const SaveDialogFields &fields);

// Creates the file or replaces it whole with text; false when it can't be
// opened or written.
bool WriteTemplateText(const std::string &path, const std::string &text);

// The schema texts of the string table: the short one of the save template,
// the long one of the open template.
std::string ShortTemplateSchema();
std::string LongTemplateSchema();

}  // namespace vantrel::dialogs
