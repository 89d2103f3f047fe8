// SPDX-License-Identifier: MIT
// The fixed identifiers that hosts and registry entries rely on.
#pragma once

#include "automation/automation.h"

namespace vantrel {

// {4C2698C4-93A5-4D02-8642-B1C2705C538F}
inline constexpr CLSID kClsidExcelVantrel = {
    0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};
// {E2A939FB-7148-46F8-B50A-6386DEB8F1BB}, version 1.0
inline constexpr GUID kLibidExcelVantrelLib = {
    0xE2A939FB, 0x7148, 0x46F8, {0xB5, 0x0A, 0x63, 0x86, 0xDE, 0xB8, 0xF1, 0xBB}};
// {57B1D7D7-0CDB-494C-896A-DDC1F72AFE15}
inline constexpr GUID kAppIdExcelVantrel = {
    0x57B1D7D7, 0x0CDB, 0x494C, {0x89, 0x6A, 0xDD, 0xC1, 0xF7, 0x2A, 0xFE, 0x15}};

inline constexpr const char *kProgId = "GenericExcelVantrel.ExcelVantrel.1";
inline constexpr const char *kVersionIndependentProgId = "GenericExcelVantrel.ExcelVantrel";
inline constexpr const char *kClassDescription = "GenericExcelVantrel Class";

}  // namespace vantrel
