// SPDX-License-Identifier: MIT
#include "cells/cell_value.h"

#include <array>

namespace workbook {
namespace {

struct ErrorInfo {
    CellError error;
    std::string_view text;
    uint32_t number;
};

constexpr std::array<ErrorInfo, 8> kErrors{{
    {CellError::Null, "#NULL!", 2000},
    {CellError::Div0, "#DIV/0!", 2007},
    {CellError::Value, "#VALUE!", 2015},
    {CellError::Ref, "#REF!", 2023},
    {CellError::Name, "#NAME?", 2029},
    {CellError::Num, "#NUM!", 2036},
    {CellError::NA, "#N/A", 2042},
    {CellError::GettingData, "#GETTING_DATA", 2043},
}};

constexpr uint32_t kErrorFacility = 0x800A0000u;

}  // namespace

std::string_view ErrorText(CellError e) { return kErrors[static_cast<size_t>(e)].text; }

std::optional<CellError> ErrorFromText(std::string_view text)
{
    for (const auto &info : kErrors)
        if (info.text == text) return info.error;
    return std::nullopt;
}

SCODE ErrorScode(CellError e)
{
    return static_cast<SCODE>(kErrorFacility | kErrors[static_cast<size_t>(e)].number);
}

std::optional<CellError> ErrorFromScode(SCODE code)
{
    for (const auto &info : kErrors)
        if (static_cast<uint32_t>(code) == (kErrorFacility | info.number)) return info.error;
    return std::nullopt;
}

}  // namespace workbook
