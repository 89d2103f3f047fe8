// SPDX-License-Identifier: MIT
// The styles of an OpenDocument spreadsheet that say how a cell shows its
// value: data styles (number:*-style) become number format codes, and cell
// styles, through their parents, name the data style they use.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "xml/xml_parser.h"

namespace workbook::ods {

class Styles : public xml::Handler {
public:
    // Fed the elements of a styles container (office:styles or
    // office:automatic-styles), from either part.
    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override;
    void OnEnd(const xml::Name &name) override;
    void OnText(std::string_view text) override;

    // The number format code of a cell style, "" for General or an unknown style.
    const std::string &FormatOf(const std::string &cellStyle);

private:
    struct DataStyle {
        std::string code;
        std::vector<std::pair<std::string, std::string>> maps;  // condition, style applied
    };
    struct CellStyle {
        std::string parent, dataStyle;
    };
    enum class Kind { Number, Percentage, Date, Other };

    void StartPart(std::string_view local, const xml::Attributes &attrs);
    void AppendLiteral(std::string_view text);
    std::string Compose(const std::string &dataStyle) const;

    std::unordered_map<std::string, DataStyle> dataStyles_;
    std::unordered_map<std::string, CellStyle> cellStyles_;
    std::unordered_map<std::string, std::string> formats_;  // cell style to code, as resolved

    // The data style being read.
    bool inDataStyle_ = false;
    Kind kind_ = Kind::Other;
    bool elapsedHours_ = false;
    std::string name_, color_;
    DataStyle current_;
    bool inLiteral_ = false;  // number:text or number:currency-symbol
    std::string literal_;
};

}  // namespace workbook::ods
