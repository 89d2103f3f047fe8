// SPDX-License-Identifier: MIT
#include "csv/delimited_parser.h"

#include <cstdio>
#include <utility>

#include "errors.h"
#include "workbook/limits.h"

namespace workbook::csv {

DelimitedParser::DelimitedParser(char separator, FieldSink sink) : separator_(separator), sink_(std::move(sink)) {}

void DelimitedParser::FailAt(uint64_t line, const std::string &what) const
{
    Fail(kBadFile, "line " + std::to_string(line) + " " + what);
}

void DelimitedParser::Feed(std::string_view bytes)
{
    for (const char c : bytes) {
        CheckUtf8(static_cast<unsigned char>(c));
        Take(c);
        // Lines are counted as a text editor counts them: LF, CRLF or CR.
        if (c == '\r') {
            ++line_;
            afterCarriageReturn_ = true;
        } else {
            if (c == '\n' && !afterCarriageReturn_) ++line_;
            afterCarriageReturn_ = false;
        }
    }
}

void DelimitedParser::Finish()
{
    if (utf8_.InCharacter()) FailAt(line_, "ends in the middle of a UTF-8 character: save the file as UTF-8");
    if (state_ == State::Quoted)
        FailAt(fieldLine_, "opens a quoted field that the file never closes: a \" is missing");
    if (state_ != State::FieldStart || column_ > 1) EndRecord();
}

void DelimitedParser::CheckUtf8(unsigned char byte)
{
    if (byte == 0) FailAt(line_, "holds a zero byte, which UTF-8 text never does (UTF-16?): save the file as UTF-8");
    // The byte named is the first of the character that doesn't read.
    const unsigned char first = utf8_.InCharacter() ? characterStart_ : byte;
    if (utf8_.Accept(byte)) {
        if (byte >= 0xC0) characterStart_ = byte;
        return;
    }
    char hex[8];
    std::snprintf(hex, sizeof hex, "0x%02X", first);
    FailAt(line_, std::string("is not UTF-8 text (at byte ") + hex + "): save the file as UTF-8");
}

void DelimitedParser::Take(char c)
{
    const bool lineBreak = c == '\n' || c == '\r';
    // The LF of a CRLF whose CR already ended the record.
    const bool secondHalf = c == '\n' && afterCarriageReturn_;
    switch (state_) {
    case State::FieldStart:
        fieldLine_ = line_;
        if (c == '"') {
            state_ = State::Quoted;
            return;
        }
        if (secondHalf) return;
        state_ = State::Unquoted;
        [[fallthrough]];
    case State::Unquoted:
        if (c == separator_) EndField();
        else if (lineBreak) EndRecord();
        else Append(c);
        return;
    case State::Quoted:
        if (c == '"') state_ = State::QuoteInQuoted;
        else if (c == '\r') Append('\n');  // a break inside a cell is LF, as a spreadsheet keeps it
        else if (!secondHalf) Append(c);
        return;
    case State::QuoteInQuoted:
        if (c == '"') {
            Append('"');
            state_ = State::Quoted;
        } else if (c == separator_) {
            EndField();
        } else if (lineBreak) {
            EndRecord();
        } else {
            // Text after the closing quote joins the field ("ab"c is abc).
            Append(c);
            state_ = State::Unquoted;
        }
        return;
    }
}

void DelimitedParser::Append(char c)
{
    if (text_.size() >= limits::kMaxCellTextBytes)
        FailAt(fieldLine_, "starts a field longer than 1 MiB, more than a cell holds");
    text_ += c;
}

void DelimitedParser::EndField()
{
    sink_(Field{row_, column_, fieldLine_, text_});
    text_.clear();
    ++column_;
    state_ = State::FieldStart;
}

void DelimitedParser::EndRecord()
{
    EndField();
    ++completeRecords_;
    ++row_;
    column_ = 1;
}

}  // namespace workbook::csv
