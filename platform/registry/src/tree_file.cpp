// SPDX-License-Identifier: MIT
#include "tree_file.h"

#include <cstdio>
#include <vector>

#include "failure.h"

namespace registry {
namespace {

std::string Quote(std::string_view text)
{
    std::string quoted = "\"";
    for (const char c : text) {
        switch (c) {
        case '\\': quoted += "\\\\"; break;
        case '"': quoted += "\\\""; break;
        case '\n': quoted += "\\n"; break;
        case '\r': quoted += "\\r"; break;
        case '\t': quoted += "\\t"; break;
        default:
            if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) {
                char escape[5];
                std::snprintf(escape, sizeof escape, "\\x%02X", static_cast<unsigned char>(c));
                quoted += escape;
            } else {
                quoted += c;
            }
        }
    }
    return quoted + '"';
}

void FormatKey(const Key &key, std::vector<std::string> &path, std::string &out)
{
    for (const auto &[name, subkey] : key.subkeys) {
        path.push_back(subkey->name);
        out += "\n[" + JoinKeyPath(path) + "]\n";
        for (const auto &[valueName, text] : subkey->values)
            out += (valueName.empty() ? std::string("@") : Quote(valueName)) + "=" + Quote(text) + "\n";
        FormatKey(*subkey, path, out);
        path.pop_back();
    }
}

int HexDigit(char c)
{
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    return -1;
}

// Reads one quoted text that starts at line[pos]; pos ends after its closing quote.
class LineReader {
public:
    LineReader(std::string_view line, size_t number) : line_(line), number_(number) {}

    [[noreturn]] void Fail(const std::string &why) const
    {
        throw Failure(REGISTRY_CORRUPT, "line " + std::to_string(number_) + ": " + why);
    }

    std::string Quoted(size_t &pos) const
    {
        if (pos >= line_.size() || line_[pos] != '"') Fail("a quoted text was expected");
        std::string text;
        for (++pos; pos < line_.size(); ++pos) {
            const char c = line_[pos];
            if (c == '"') {
                ++pos;
                return text;
            }
            if (c != '\\') {
                text += c;
                continue;
            }
            if (++pos >= line_.size()) break;
            switch (line_[pos]) {
            case '\\': text += '\\'; break;
            case '"': text += '"'; break;
            case 'n': text += '\n'; break;
            case 'r': text += '\r'; break;
            case 't': text += '\t'; break;
            case 'x': {
                const int high = pos + 2 < line_.size() ? HexDigit(line_[pos + 1]) : -1;
                const int low = pos + 2 < line_.size() ? HexDigit(line_[pos + 2]) : -1;
                if (high < 0 || low < 0 || (high == 0 && low == 0))
                    Fail("\\x must be followed by two hex digits, not 00");
                text += static_cast<char>(high * 16 + low);
                pos += 2;
                break;
            }
            default: Fail(std::string("unknown escape \\") + line_[pos]);
            }
        }
        Fail("a quoted text has no closing quote");
    }

private:
    std::string_view line_;
    size_t number_;
};

bool IsBlank(std::string_view line)
{
    return line.find_first_not_of(" \t") == std::string_view::npos;
}

}  // namespace

std::string FormatTree(const Key &root, std::string_view title)
{
    std::string out(kTreeFileHeader);
    out += "\n; " + std::string(title) + "\n";
    std::vector<std::string> path;
    FormatKey(root, path, out);
    return out;
}

void ParseTree(std::string_view text, Key &root)
{
    Key *current = nullptr;
    size_t number = 0;
    size_t start = 0;
    while (start < text.size()) {
        size_t end = text.find('\n', start);
        if (end == std::string_view::npos) end = text.size();
        std::string_view line = text.substr(start, end - start);
        start = end + 1;
        ++number;
        if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
        const LineReader reader(line, number);

        if (number == 1) {
            if (line != kTreeFileHeader)
                reader.Fail("this is not a registry file: the first line must be \"" +
                            std::string(kTreeFileHeader) + "\"");
            continue;
        }
        if (line.find('\0') != std::string_view::npos) reader.Fail("the line holds a zero byte");
        if (IsBlank(line) || line.front() == ';') continue;

        if (line.front() == '[') {
            if (line.size() < 3 || line.back() != ']') reader.Fail("a key line must be [path]");
            try {
                current = &root.Create(SplitKeyPath(line.substr(1, line.size() - 2)));
            } catch (const Failure &bad) {
                reader.Fail(bad.what());
            }
            continue;
        }

        if (!current) reader.Fail("a value stands before any key");
        size_t pos = 0;
        std::string name;
        if (line.front() == '@')
            pos = 1;
        else
            name = reader.Quoted(pos);
        if (line.front() != '@' && name.empty()) reader.Fail("the default value is written @, not \"\"");
        if (pos >= line.size() || line[pos] != '=') reader.Fail("'=' was expected after the value name");
        ++pos;
        std::string value = reader.Quoted(pos);
        if (!IsBlank(line.substr(pos))) reader.Fail("text follows the value");
        try {
            CheckValueName(name);
        } catch (const Failure &bad) {
            reader.Fail(bad.what());
        }
        current->SetValue(name, std::move(value));
    }
    if (number == 0) throw Failure(REGISTRY_CORRUPT, "the file is empty: it has no header line");
}

}  // namespace registry
