// SPDX-License-Identifier: MIT
// The styles part (xl/styles.xml): the number format of each cell format
// (cellXfs), custom number formats, and the formats the engine adds. Writing
// changes only numFmts and cellXfs; every other element stays as it was.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "xml/xml_splice.h"

namespace workbook {

// The first id of a custom number format; 0..163 are built in.
inline constexpr uint32_t kFirstCustomFormatId = 164;

class Styles {
public:
    static Styles Parse(std::string_view xml, const std::string &partName);
    // The formats of a workbook without a styles part: one plain cell format.
    static Styles Default();

    bool HasPart() const { return hasPart_; }
    bool Changed() const { return changed_; }
    uint32_t CellFormatCount() const { return static_cast<uint32_t>(xfNumFmt_.size()); }

    // Number format id and code of a cell format; an unknown index reads as 0
    // ("General").
    uint32_t NumberFormatIdOf(uint32_t xf) const;
    std::string NumberFormatOf(uint32_t xf) const;
    // Whether a cell format shows General: id 0, or a custom format whose code
    // is "General" in any case, as some producers store it (id 164 and up).
    bool IsGeneral(uint32_t xf) const;
    // Whether a cell format is Text ("@"), under which an entry stays text.
    bool IsText(uint32_t xf) const;

    // A cell format equal to base but for its number format, added if needed.
    // A code equal to a built-in format takes the built-in id.
    uint32_t WithNumberFormat(uint32_t base, std::string_view code);
    uint32_t WithNumberFormatId(uint32_t base, uint32_t numFmtId);

    // The styles part text (as parsed) with the added formats.
    std::string Write(std::string_view text) const;
    // A whole styles part, for a workbook that had none.
    std::string Compose(std::string_view mainNs) const;
    // Takes the part as saved for the one read, keeping the formats derived so far.
    void Rebase(std::string_view savedText, const std::string &partName);

private:
    std::string XfXml(uint32_t xf, std::string_view prefix) const;
    std::string NumFmtsXml(std::string_view prefix) const;

    bool hasPart_ = false;
    bool changed_ = false;
    std::map<uint32_t, std::string> customFormats_;
    std::vector<uint32_t> xfNumFmt_;
    std::vector<std::string> xfXml_;  // as written in the part; empty for added ones
    std::vector<uint32_t> xfBase_;    // for added formats: the format they copy
    uint32_t partXfCount_ = 0;
    std::map<std::pair<uint32_t, uint32_t>, uint32_t> derived_;

    xml::RootShape root_;
    xml::Span numFmts_;
    xml::Span cellXfsStart_, cellXfsEnd_;
    uint64_t insertXfsAt_ = 0;  // where cellXfs would go when the part has none
};

}  // namespace workbook
