// SPDX-License-Identifier: MIT
// The fields of a date/time format and the reading of cell text into them.
#pragma once

#include <array>
#include <optional>
#include <string_view>

namespace vantrel::datetime {

enum class Field { Year, Month, Day, Hour, Minute, Second };

// What a format field accepts.
struct FieldRule {
    Field field;
    int minimum;
    int maximum;
};

// The field that a format token's first letter names. Only M and m differ by
// case; any other letter names no field.
std::optional<FieldRule> FieldOfLetter(char letter);

// True if every character of the token equals its first one.
bool AllLettersSame(std::string_view token);

// The leading integer of a token the way the C format "%d" reads it: blanks,
// an optional sign, then at least one digit; the rest of the token is ignored.
// Values beyond the 32-bit range are clamped to it.
std::optional<int> ReadDecimal(std::string_view token);

// Six fields indexed by Field.
using FieldValues = std::array<int, 6>;

inline int &At(FieldValues &values, Field field) { return values[static_cast<size_t>(field)]; }

// Which fields a read takes; tokens of the other fields are passed over.
enum class FieldSet { All, DateOnly, TimeOnly };

// Reads the tokens of text against those of format, in step, until the format
// has no more. A field whose text token is missing keeps its value in fields;
// a field that is present must read as a number within its range. Tokens of
// letters outside the table or outside set are passed over. On false, fields
// may be partly changed.
bool ReadFields(std::string_view text, std::string_view format, FieldSet set, FieldValues &fields);

}  // namespace vantrel::datetime
