// SPDX-License-Identifier: MIT
// The text a cell shows, put together from its paragraphs as a spreadsheet
// puts it together: paragraphs on lines of their own, white space in the XML
// collapsed to one space, and the spaces, tabs and line breaks the file spells
// out as elements kept as they are.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace workbook::ods {

class CellText {
public:
    void Clear();
    void StartParagraph();
    // Character data inside a paragraph.
    void AddText(std::string_view text);
    // text:s (count spaces), text:tab and text:line-break.
    void AddSpaces(uint64_t count);
    void AddTab() { Add('\t'); }
    void AddLineBreak() { Add('\n'); }

    bool Empty() const { return text_.empty() && paragraphs_ == 0; }
    const std::string &Text() const { return text_; }
    std::string Take() { return std::move(text_); }

private:
    void Add(char c);
    void Reserve(size_t more);

    std::string text_;
    uint32_t paragraphs_ = 0;
    bool afterSpace_ = true;  // a space of the XML here would be collapsed
};

}  // namespace workbook::ods
