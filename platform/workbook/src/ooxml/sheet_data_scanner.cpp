// SPDX-License-Identifier: MIT
#include "ooxml/sheet_data_scanner.h"

#include <array>
#include <charconv>
#include <limits>

#include "xml/xml_text.h"

namespace workbook {
namespace {

constexpr std::string_view kXmlNamespace = "http://www.w3.org/XML/1998/namespace";
// More attributes than any cell or row carries: past it expat reads the tag,
// which keeps the duplicate check here short.
constexpr size_t kMaxAttributes = 32;
// The longest reference read here: "&#x10FFFF;" and "&#1114111;".
constexpr size_t kMaxReference = 10;
constexpr size_t kIncomplete = std::numeric_limits<size_t>::max();

bool IsSpace(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }
bool IsNameStart(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_'; }

// The ASCII characters a name may hold after its first, by byte.
constexpr auto kNameChars = [] {
    std::array<bool, 256> table{};
    for (int c = 0; c < 256; ++c)
        table[static_cast<size_t>(c)] = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
                                        c == '_' || c == '-' || c == '.';
    return table;
}();
bool IsNameChar(char c) { return kNameChars[static_cast<unsigned char>(c)]; }

// Bytes that may stand in a plain cell's attribute value (quotes apart) and
// in its <v> text: printable ASCII without markup; ']' is left out of the text,
// where "]]>" is an error.
constexpr auto kPlainBytes = [] {
    std::array<uint8_t, 256> table{};
    for (int c = 0x20; c < 0x80; ++c)
        if (c != '<' && c != '&') table[static_cast<size_t>(c)] = c == ']' ? 1 : 3;
    return table;
}();
constexpr uint8_t kInAttribute = 1, kInValue = 2;
bool PlainIn(char c, uint8_t where) { return (kPlainBytes[static_cast<unsigned char>(c)] & where) != 0; }

bool IsXmlChar(uint32_t cp)
{
    return cp == 0x9 || cp == 0xA || cp == 0xD || (cp >= 0x20 && cp <= 0xD7FF) || (cp >= 0xE000 && cp <= 0xFFFD) ||
           (cp >= 0x10000 && cp <= 0x10FFFF);
}

// Length of the UTF-8 sequence at p when it encodes a character XML allows,
// 0 when it doesn't, kIncomplete when the data ends inside it.
size_t Utf8CharLength(std::string_view data, size_t p)
{
    const auto lead = static_cast<unsigned char>(data[p]);
    size_t length = 0;
    uint32_t cp = 0;
    if (lead < 0xC2) return 0;  // a continuation byte, or an overlong form
    if (lead < 0xE0) {
        length = 2;
        cp = lead & 0x1Fu;
    } else if (lead < 0xF0) {
        length = 3;
        cp = lead & 0x0Fu;
    } else if (lead < 0xF5) {
        length = 4;
        cp = lead & 0x07u;
    } else {
        return 0;
    }
    if (data.size() - p < length) return kIncomplete;
    for (size_t i = 1; i < length; ++i) {
        const auto b = static_cast<unsigned char>(data[p + i]);
        if ((b & 0xC0u) != 0x80u) return 0;
        cp = (cp << 6) | (b & 0x3Fu);
    }
    if ((length == 3 && cp < 0x800) || (length == 4 && cp < 0x10000)) return 0;
    return IsXmlChar(cp) ? length : 0;
}

}  // namespace

SheetDataScanner::SheetDataScanner(xml::Handler &handler, PlainCellHandler &plainCells, std::string defaultNs,
                                   std::vector<std::pair<std::string, std::string>> prefixes)
    : handler_(handler), plainCells_(plainCells), defaultNs_(std::move(defaultNs)), prefixes_(std::move(prefixes))
{
}

SheetDataScanner::Result SheetDataScanner::Scan(std::string_view data)
{
    size_t pos = 0;
    for (;;) {
        size_t p = pos;
        while (p < data.size() && IsSpace(data[p])) ++p;
        if (data.size() - p < 2) return {pos, Stop::NeedMore};
        if (data[p] != '<') return {pos, Stop::Unusual};
        if (data[p + 1] == '/') {
            constexpr std::string_view kEnd = "</sheetData";
            if (data.size() - p <= kEnd.size()) return {pos, Stop::NeedMore};
            const char after = data[p + kEnd.size()];
            if (data.substr(p, kEnd.size()) == kEnd && (IsSpace(after) || after == '>')) return {pos, Stop::End};
            return {pos, Stop::Unusual};
        }
        Outcome outcome = ReadRow(data, p);
        if (outcome == Outcome::NeedMore) return {pos, Stop::NeedMore};
        if (outcome == Outcome::Unusual) return {pos, Stop::Unusual};
        Report();
        ++rowsRead_;
        pos = p;
    }
}

constexpr size_t kMaxRowNesting = 32;

// Reads one <row> element whole, from its '<' at pos, into tokens_.
SheetDataScanner::Outcome SheetDataScanner::ReadRow(std::string_view data, size_t &pos)
{
    tokens_.clear();
    attrs_.clear();
    arena_.clear();
    open_.clear();
    cells_.clear();
    size_t p = pos;
    if (!IsNameStart(data[p + 1])) return Outcome::Unusual;
    bool empty = false;
    Outcome outcome = ReadStartTag(data, p, empty);
    if (outcome != Outcome::Complete) return outcome;
    if (!tokens_.front().name.prefix.empty() || tokens_.front().name.local != "row") return Outcome::Unusual;
    while (!open_.empty()) {
        if (p >= data.size()) return Outcome::NeedMore;
        if (data[p] != '<') {
            outcome = ReadText(data, p);
        } else {
            if (data.size() - p < 2) return Outcome::NeedMore;
            if (data[p + 1] == '/') {
                outcome = ReadEndTag(data, p);
            } else if (IsNameStart(data[p + 1])) {
                outcome = Outcome::Unusual;
                if (open_.size() == 1 && data[p + 1] == 'c') {
                    PlainCell &cell = cells_.emplace_back();
                    outcome = ReadPlainCell(data, p, cell);
                    if (outcome != Outcome::Complete) {
                        cells_.pop_back();
                    } else if (!tokens_.empty() && tokens_.back().kind == Token::Kind::PlainCells) {
                        ++tokens_.back().textSize;  // one more in the run of cells
                    } else {
                        Token token{};
                        token.kind = Token::Kind::PlainCells;
                        token.textAt = static_cast<uint32_t>(cells_.size() - 1);
                        token.textSize = 1;
                        tokens_.push_back(token);
                    }
                }
                // Any other form of element is read token by token.
                if (outcome == Outcome::Unusual) outcome = ReadStartTag(data, p, empty);
            } else {
                return Outcome::Unusual;  // comment, CDATA, processing instruction, or bad XML
            }
        }
        if (outcome != Outcome::Complete) return outcome;
        // A row nests a handful deep (row, c, is, r, t); expat reads one that
        // goes deeper, and holds it to the bound on nesting.
        if (open_.size() > kMaxRowNesting) return Outcome::Unusual;
    }
    pos = p;
    return Outcome::Complete;
}

// A cell in the plain form, from its '<' at pos. Unusual means only that the
// cell is not plain: the caller reads it token by token.
SheetDataScanner::Outcome SheetDataScanner::ReadPlainCell(std::string_view data, size_t &pos, PlainCell &cell)
{
    const size_t n = data.size();
    size_t p = pos + 2;
    if (p >= n) return Outcome::NeedMore;
    if (!IsSpace(data[p]) && data[p] != '>' && data[p] != '/') return Outcome::Unusual;  // a longer name
    for (;;) {
        const size_t spaceAt = p;
        while (p < n && IsSpace(data[p])) ++p;
        if (p + 1 >= n) return Outcome::NeedMore;
        const char c = data[p];
        if (c == '>') {
            ++p;
            break;
        }
        if (c == '/') {
            if (data[p + 1] != '>') return Outcome::Unusual;
            pos = p + 2;
            return Outcome::Complete;
        }
        if (p == spaceAt) return Outcome::Unusual;
        std::optional<std::string_view> *slot = c == 'r' ? &cell.ref : c == 's' ? &cell.style : c == 't' ? &cell.type : nullptr;
        if (!slot || slot->has_value()) return Outcome::Unusual;
        ++p;
        while (p < n && IsSpace(data[p])) ++p;
        if (p + 1 >= n) return Outcome::NeedMore;
        if (data[p] != '=') return Outcome::Unusual;  // a longer name, or a prefixed one
        ++p;
        while (p < n && IsSpace(data[p])) ++p;
        if (p >= n) return Outcome::NeedMore;
        const char quote = data[p++];
        if (quote != '"' && quote != '\'') return Outcome::Unusual;
        const size_t valueAt = p;
        while (p < n && data[p] != quote && PlainIn(data[p], kInAttribute)) ++p;
        if (p >= n) return Outcome::NeedMore;
        if (data[p] != quote) return Outcome::Unusual;
        *slot = data.substr(valueAt, p - valueAt);
        ++p;
    }
    constexpr std::string_view kEmpty = "</c>", kValue = "<v>", kValueEnd = "</v></c>";
    if (n - p < kEmpty.size()) return Outcome::NeedMore;
    if (data.compare(p, kEmpty.size(), kEmpty) == 0) {
        pos = p + kEmpty.size();
        return Outcome::Complete;
    }
    if (data.compare(p, kValue.size(), kValue) != 0) return Outcome::Unusual;
    p += kValue.size();
    const size_t valueAt = p;
    while (p < n && PlainIn(data[p], kInValue)) ++p;
    if (p < n && data[p] != '<') return Outcome::Unusual;
    if (n - p < kValueEnd.size()) return Outcome::NeedMore;
    if (data.compare(p, kValueEnd.size(), kValueEnd) != 0) return Outcome::Unusual;
    cell.hasValue = true;
    cell.value = data.substr(valueAt, p - valueAt);
    pos = p + kValueEnd.size();
    return Outcome::Complete;
}

namespace {

enum class NameRead { Complete, NeedMore, Unusual };

NameRead ReadNcName(std::string_view data, size_t &pos, std::string_view &name)
{
    size_t p = pos;
    if (p >= data.size()) return NameRead::NeedMore;
    if (!IsNameStart(data[p])) return NameRead::Unusual;
    while (++p < data.size() && IsNameChar(data[p])) {
    }
    if (p == data.size()) return NameRead::NeedMore;
    if (static_cast<unsigned char>(data[p]) >= 0x80) return NameRead::Unusual;  // a name that goes on beyond ASCII
    name = data.substr(pos, p - pos);
    pos = p;
    return NameRead::Complete;
}

// A name, with a prefix when it has one.
NameRead ReadQName(std::string_view data, size_t &pos, std::string_view &prefix, std::string_view &local)
{
    std::string_view first;
    NameRead r = ReadNcName(data, pos, first);
    if (r != NameRead::Complete) return r;
    if (data[pos] != ':') {
        prefix = {};
        local = first;
        return NameRead::Complete;
    }
    ++pos;
    prefix = first;
    return ReadNcName(data, pos, local);
}

}  // namespace

bool SheetDataScanner::Resolve(std::string_view prefix, std::string_view &uri) const
{
    if (prefix == "xml") {
        uri = kXmlNamespace;
        return true;
    }
    for (auto it = prefixes_.rbegin(); it != prefixes_.rend(); ++it) {
        if (it->first == prefix) {
            uri = it->second;
            return !uri.empty();  // an undeclared prefix binds nothing
        }
    }
    return false;
}

SheetDataScanner::Outcome SheetDataScanner::ReadStartTag(std::string_view data, size_t &pos, bool &empty)
{
    auto fromName = [](NameRead r) { return r == NameRead::NeedMore ? Outcome::NeedMore : Outcome::Unusual; };
    size_t p = pos + 1;
    const size_t nameAt = p;
    Token token{};
    token.kind = Token::Kind::Start;
    NameRead r = ReadQName(data, p, token.name.prefix, token.name.local);
    if (r != NameRead::Complete) return fromName(r);
    const std::string_view qualified = data.substr(nameAt, p - nameAt);
    if (token.name.prefix.empty()) token.name.ns = defaultNs_;
    else if (token.name.prefix == "xml" || !Resolve(token.name.prefix, token.name.ns)) return Outcome::Unusual;
    token.attrBegin = static_cast<uint32_t>(attrs_.size());
    tagAttributes_.clear();
    for (;;) {
        const size_t spaceAt = p;
        while (p < data.size() && IsSpace(data[p])) ++p;
        if (p >= data.size()) return Outcome::NeedMore;
        if (data[p] == '>') {
            ++p;
            empty = false;
            break;
        }
        if (data[p] == '/') {
            if (p + 1 >= data.size()) return Outcome::NeedMore;
            if (data[p + 1] != '>') return Outcome::Unusual;
            p += 2;
            empty = true;
            break;
        }
        if (p == spaceAt) return Outcome::Unusual;  // attributes are parted by white space
        std::string_view prefix, local;
        r = ReadQName(data, p, prefix, local);
        if (r != NameRead::Complete) return fromName(r);
        if (prefix == "xmlns" || (prefix.empty() && local == "xmlns")) return Outcome::Unusual;
        std::string_view uri;
        if (!prefix.empty() && !Resolve(prefix, uri)) return Outcome::Unusual;
        while (p < data.size() && IsSpace(data[p])) ++p;
        if (p >= data.size()) return Outcome::NeedMore;
        if (data[p++] != '=') return Outcome::Unusual;
        while (p < data.size() && IsSpace(data[p])) ++p;
        if (p >= data.size()) return Outcome::NeedMore;
        const char quote = data[p++];
        if (quote != '"' && quote != '\'') return Outcome::Unusual;
        const size_t valueAt = p;
        while (p < data.size() && data[p] != quote) {
            const auto c = static_cast<unsigned char>(data[p]);
            // Values with references, white space to normalise, or bytes
            // beyond ASCII are left to expat.
            if (c < 0x20 || c >= 0x80 || c == '<' || c == '&') return Outcome::Unusual;
            ++p;
        }
        if (p >= data.size()) return Outcome::NeedMore;
        const std::string_view value = data.substr(valueAt, p - valueAt);
        ++p;
        // The same name twice (after namespaces) is an error for expat to tell.
        const size_t count = (attrs_.size() - token.attrBegin) / 2;
        if (count >= kMaxAttributes) return Outcome::Unusual;
        for (const auto &[seenUri, seenLocal] : tagAttributes_)
            if (seenLocal == local && seenUri == uri) return Outcome::Unusual;
        tagAttributes_.emplace_back(uri, local);
        attrs_.push_back(static_cast<uint32_t>(arena_.size()));
        if (uri.empty()) {
            arena_.append(local);
        } else {
            // As expat names an attribute in a namespace: uri, local name, prefix.
            arena_.append(uri).append(1, '\x01').append(local).append(1, '\x01').append(prefix);
        }
        arena_.push_back('\0');
        attrs_.push_back(static_cast<uint32_t>(arena_.size()));
        arena_.append(value);
        arena_.push_back('\0');
    }
    token.attrEnd = static_cast<uint32_t>(attrs_.size());
    tokens_.push_back(token);
    if (empty) {
        Token end{};
        end.kind = Token::Kind::End;
        end.name = token.name;
        tokens_.push_back(end);
    } else {
        open_.push_back({qualified, token.name});
    }
    pos = p;
    return Outcome::Complete;
}

SheetDataScanner::Outcome SheetDataScanner::ReadEndTag(std::string_view data, size_t &pos)
{
    // The name must be the open element's, as written, and end there.
    const std::string_view name = open_.back().first;
    size_t p = pos + 2;
    if (data.size() - p <= name.size()) return Outcome::NeedMore;
    if (data.compare(p, name.size(), name) != 0) return Outcome::Unusual;
    p += name.size();
    while (p < data.size() && IsSpace(data[p])) ++p;
    if (p >= data.size()) return Outcome::NeedMore;
    if (data[p] != '>') return Outcome::Unusual;
    Token end{};
    end.kind = Token::Kind::End;
    end.name = open_.back().second;
    tokens_.push_back(end);
    open_.pop_back();
    pos = p + 1;
    return Outcome::Complete;
}

// Character data up to the next '<', with its references replaced.
SheetDataScanner::Outcome SheetDataScanner::ReadText(std::string_view data, size_t &pos)
{
    const size_t start = pos;
    size_t p = pos;
    bool decoded = false;  // the text goes into the arena once a reference is met
    const size_t arenaAt = arena_.size();
    for (;;) {
        if (p >= data.size()) return Outcome::NeedMore;
        const char c = data[p];
        if (c == '<') break;
        const auto u = static_cast<unsigned char>(c);
        if (u >= 0x80) {
            const size_t length = Utf8CharLength(data, p);
            if (length == kIncomplete) return Outcome::NeedMore;
            if (length == 0) return Outcome::Unusual;
            if (decoded) arena_.append(data.substr(p, length));
            p += length;
            continue;
        }
        // expat turns CR into LF in text: that, and control characters, are its to handle.
        if (u < 0x20 && c != '\t' && c != '\n') return Outcome::Unusual;
        if (c == ']') {
            if (data.size() - p < 3) return Outcome::NeedMore;
            if (data[p + 1] == ']' && data[p + 2] == '>') return Outcome::Unusual;
        }
        if (c != '&') {
            if (decoded) arena_.push_back(c);
            ++p;
            continue;
        }
        const size_t semicolon = data.substr(p, kMaxReference + 1).find(';');
        if (semicolon == std::string_view::npos)
            return data.size() - p <= kMaxReference ? Outcome::NeedMore : Outcome::Unusual;
        const std::string_view name = data.substr(p + 1, semicolon - 1);
        if (!decoded) {
            decoded = true;
            arena_.append(data.substr(start, p - start));
        }
        if (name == "lt") arena_.push_back('<');
        else if (name == "gt") arena_.push_back('>');
        else if (name == "amp") arena_.push_back('&');
        else if (name == "quot") arena_.push_back('"');
        else if (name == "apos") arena_.push_back('\'');
        else if (name.size() >= 2 && name[0] == '#') {
            const bool hex = name[1] == 'x';
            const std::string_view digits = name.substr(hex ? 2 : 1);
            uint32_t cp = 0;
            auto [end, ec] = std::from_chars(digits.data(), digits.data() + digits.size(), cp, hex ? 16 : 10);
            if (digits.empty() || ec != std::errc() || end != digits.data() + digits.size() || !IsXmlChar(cp))
                return Outcome::Unusual;
            xml::AppendUtf8(arena_, static_cast<char32_t>(cp));
        } else {
            return Outcome::Unusual;  // an entity of the document's own: expat refuses it
        }
        p += semicolon + 1;
    }
    if (p > start) {
        Token text{};
        text.kind = Token::Kind::Text;
        if (decoded) {
            text.textInArena = true;
            text.textAt = static_cast<uint32_t>(arenaAt);
            text.textSize = static_cast<uint32_t>(arena_.size() - arenaAt);
        } else {
            text.text = data.substr(start, p - start);
        }
        tokens_.push_back(text);
    }
    pos = p;
    return Outcome::Complete;
}

void SheetDataScanner::Report()
{
    for (const Token &token : tokens_) {
        switch (token.kind) {
        case Token::Kind::Start:
            attrPointers_.clear();
            for (uint32_t i = token.attrBegin; i < token.attrEnd; ++i) attrPointers_.push_back(arena_.data() + attrs_[i]);
            attrPointers_.push_back(nullptr);
            handler_.OnStart(token.name, xml::Attributes(attrPointers_.data()));
            break;
        case Token::Kind::End:
            handler_.OnEnd(token.name);
            break;
        case Token::Kind::PlainCells:
            for (uint32_t i = token.textAt; i < token.textAt + token.textSize; ++i) plainCells_.OnPlainCell(cells_[i]);
            break;
        case Token::Kind::Text:
            handler_.OnText(token.textInArena ? std::string_view(arena_.data() + token.textAt, token.textSize)
                                              : token.text);
            break;
        }
    }
}

}  // namespace workbook
