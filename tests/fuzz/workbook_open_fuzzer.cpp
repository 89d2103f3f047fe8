// SPDX-License-Identifier: MIT
// The workbook engine's Open on a file of arbitrary bytes, then every sheet's
// used range read as an import reads it. Refusing is fine, with the engine's
// error; any other way out is a finding.
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "automation/com_error.h"
#include "fuzz_input.h"
#include "workbook/engine.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static fuzz::ScratchFile file(".xlsx");
    const std::string &path = file.Write(std::string_view(reinterpret_cast<const char *>(data), size));
    auto app = workbook::CreateApplication();
    try {
        auto book = app->GetWorkbooks()->Open(path);
        auto sheets = book->GetWorksheets();
        for (int32_t i = 1; i <= sheets->Count(); ++i) sheets->Item(i)->UsedRange()->GetValue2();
    } catch (const automation::ComError &) {
    }
    app->Quit();
    return 0;
}
