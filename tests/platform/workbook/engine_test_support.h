// SPDX-License-Identifier: MIT
// Helpers of the workbook engine's tests: files, packages made on the spot,
// and checks of the automation errors the engine raises.
#pragma once

#include <gtest/gtest.h>

#include <map>
#include <string>

#include "automation/com_error.h"
#include "automation/values.h"
#include "expect_hr.h"
#include "files.h"
#include "minimal_package.h"
#include "package/zip_source.h"
#include "temp_dir.h"
#include "workbook/engine.h"

namespace engine_test {

// Every entry of a zip file, inflated.
inline std::map<std::string, std::string> ZipEntries(const std::string &path)
{
    auto source = workbook::PackageSource::OpenFile(path);
    std::map<std::string, std::string> entries;
    for (const auto &name : source->EntryNames()) entries[name] = source->ReadAll(name);
    return entries;
}

// Opens the file and reads every worksheet's used range, as an import does.
inline void OpenAndRead(const std::string &path)
{
    auto app = workbook::CreateApplication();
    auto sheets = app->GetWorkbooks()->Open(path)->GetWorksheets();
    for (int32_t i = 1; i <= sheets->Count(); ++i) sheets->Item(i)->UsedRange()->GetValue2();
}

inline automation::Variant Missing() { return automation::Variant::Missing(); }

inline std::string Utf8(const automation::Variant &v) { return automation::BstrToUtf8(v.Raw().bstrVal); }

}  // namespace engine_test

// Runs statement and expects a ComError with code hr whose text holds part.
#define EXPECT_COM_ERROR(statement, hr, part)                                           \
    do {                                                                                \
        try {                                                                           \
            statement;                                                                  \
            ADD_FAILURE() << #statement " raised nothing";                              \
        } catch (const automation::ComError &e) {                                       \
            EXPECT_HR(hr, e.Code());                                                    \
            EXPECT_NE(std::string(e.what()).find(part), std::string::npos) << e.what(); \
        }                                                                               \
    } while (0)
