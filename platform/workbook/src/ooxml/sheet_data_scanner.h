// SPDX-License-Identifier: MIT
// A reader for the rows inside a worksheet's sheetData, the bulk of a big
// part, that takes the place of expat there. It reads the common forms only:
// elements without a prefix or with one declared on the root or on
// sheetData, attributes with plain values, text with the predefined and
// numeric character references, UTF-8. A row is checked whole before any of
// it is reported, and reported to the handler as expat would report it;
// anything else (a comment, CDATA, a processing instruction, a namespace
// declaration, a CR in text, an entity of another kind, a byte XML doesn't
// allow, a mismatched end tag...) stops it before that row, so that expat
// reads the rest and judges it.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "xml/xml_parser.h"

namespace workbook {

// A cell in its commonest form, straight inside its row: <c> with r, s and t
// attributes at most (plain values), holding one <v> with plain text, or
// nothing.
struct PlainCell {
    std::optional<std::string_view> ref, type, style;
    bool hasValue = false;  // a <v> element, maybe empty
    std::string_view value;
};

class PlainCellHandler {
public:
    virtual ~PlainCellHandler() = default;
    // Does what the events of the cell's elements and text would do.
    virtual void OnPlainCell(const PlainCell &cell) = 0;
};

class SheetDataScanner {
public:
    // The namespaces in scope inside sheetData: the default one (that of
    // sheetData itself) and the prefixes bound on its ancestors.
    SheetDataScanner(xml::Handler &handler, PlainCellHandler &plainCells, std::string defaultNs,
                     std::vector<std::pair<std::string, std::string>> prefixes);

    enum class Stop {
        NeedMore,  // the data ends inside a row: call again with more
        End,       // </sheetData> starts at `consumed`
        Unusual,   // something for expat starts at `consumed`
    };
    struct Result {
        size_t consumed = 0;  // bytes of whole rows read and reported
        Stop stop = Stop::NeedMore;
    };

    // Reads whole rows from the start of data, which follows the sheetData
    // start tag or the last row read. The handler's exceptions pass through.
    Result Scan(std::string_view data);
    // Rows read and reported so far.
    uint64_t RowsRead() const { return rowsRead_; }

private:
    enum class Outcome { Complete, NeedMore, Unusual };
    struct Token {
        enum class Kind : uint8_t { Start, End, Text, PlainCells } kind;
        bool textInArena = false;
        xml::Name name;
        uint32_t attrBegin = 0, attrEnd = 0;  // pairs of arena offsets in attrs_
        std::string_view text;                // Text outside the arena
        uint32_t textAt = 0, textSize = 0;    // Text in the arena; a run of PlainCells in cells_
    };

    Outcome ReadRow(std::string_view data, size_t &pos);
    Outcome ReadPlainCell(std::string_view data, size_t &pos, PlainCell &cell);
    Outcome ReadStartTag(std::string_view data, size_t &pos, bool &empty);
    Outcome ReadEndTag(std::string_view data, size_t &pos);
    Outcome ReadText(std::string_view data, size_t &pos);
    Outcome ReadAttributeValue(std::string_view data, size_t &pos, char quote);
    bool Resolve(std::string_view prefix, std::string_view &uri) const;
    void Report();

    xml::Handler &handler_;
    PlainCellHandler &plainCells_;
    std::string defaultNs_;
    std::vector<std::pair<std::string, std::string>> prefixes_;

    // The row being read: its tokens, the names open in it, and the texts
    // made for it (attributes as "expanded\0value\0", decoded texts).
    std::vector<Token> tokens_;
    std::vector<std::pair<std::string_view, xml::Name>> open_;  // as written, and as reported
    std::vector<uint32_t> attrs_;
    std::vector<std::pair<std::string_view, std::string_view>> tagAttributes_;  // uri and local name
    std::string arena_;
    std::vector<const char *> attrPointers_;
    std::vector<PlainCell> cells_;
    uint64_t rowsRead_ = 0;
};

}  // namespace workbook
