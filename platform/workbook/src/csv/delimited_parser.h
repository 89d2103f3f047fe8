// SPDX-License-Identifier: MIT
// Splits delimited text into fields as it streams in: quoted fields may hold
// the separator, doubled quotes and line breaks; records end at LF, CRLF or
// a lone CR. The text must be UTF-8; a field is at most one cell's text.
// Faults raise ComError (kBadFile) naming the line of the file.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "csv/utf8_checker.h"

namespace workbook::csv {

struct Field {
    uint64_t row = 0;     // the record, from 1
    uint64_t column = 0;  // the field within it, from 1
    uint64_t line = 0;    // the line of the file where the field starts
    std::string_view text;
};

class DelimitedParser {
public:
    using FieldSink = std::function<void(const Field &)>;

    DelimitedParser(char separator, FieldSink sink);

    // The next bytes of the text (after any byte-order mark).
    void Feed(std::string_view bytes);
    // The end of the text: the last record, if it has no line break.
    void Finish();

    // Records whose last field has been handed over.
    uint64_t CompleteRecords() const { return completeRecords_; }

private:
    enum class State { FieldStart, Unquoted, Quoted, QuoteInQuoted };

    void Take(char c);
    void Append(char c);
    void EndField();
    void EndRecord();
    void CheckUtf8(unsigned char byte);
    [[noreturn]] void FailAt(uint64_t line, const std::string &what) const;

    char separator_;
    FieldSink sink_;
    State state_ = State::FieldStart;
    std::string text_;
    uint64_t row_ = 1, column_ = 1, line_ = 1, fieldLine_ = 1;
    uint64_t completeRecords_ = 0;
    bool afterCarriageReturn_ = false;  // a LF right after it ends nothing more
    Utf8Checker utf8_;
    unsigned char characterStart_ = 0;
};

}  // namespace workbook::csv
