// SPDX-License-Identifier: MIT
#include "ods/cell_text.h"

#include "errors.h"
#include "workbook/limits.h"

namespace workbook::ods {

void CellText::Clear()
{
    text_.clear();
    paragraphs_ = 0;
    afterSpace_ = true;
}

void CellText::Reserve(size_t more)
{
    if (more > limits::kMaxCellTextBytes || text_.size() > limits::kMaxCellTextBytes - more)
        Fail(kBadFile, "its text is longer than 1 MiB");
}

void CellText::StartParagraph()
{
    if (paragraphs_++ > 0) Add('\n');
    afterSpace_ = true;
}

void CellText::AddText(std::string_view text)
{
    Reserve(text.size());
    for (char c : text) {
        if (c == ' ' || c == '\t' || c == '\n' || c == '\r') {
            if (!afterSpace_) text_ += ' ';
            afterSpace_ = true;
        } else {
            text_ += c;
            afterSpace_ = false;
        }
    }
}

void CellText::AddSpaces(uint64_t count)
{
    Reserve(count);
    text_.append(size_t(count), ' ');
    afterSpace_ = false;
}

void CellText::Add(char c)
{
    Reserve(1);
    text_ += c;
    afterSpace_ = false;
}

}  // namespace workbook::ods
