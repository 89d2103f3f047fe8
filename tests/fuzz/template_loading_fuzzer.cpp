// SPDX-License-Identifier: MIT
// A template file of arbitrary bytes, loaded as an open and as a save
// template. A load may fail, with a message; it may not crash or hang.
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "fuzz_input.h"
#include "specification/records.h"
#include "specification/specification.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static fuzz::ScratchFile file(".xml");
    const std::string &path = file.Write(std::string_view(reinterpret_cast<const char *>(data), size));

    CSpecification openReader;
    OpenSpecification open;
    std::string error;
    if (!openReader.LoadOpenTemplate(path, open, error)) fuzz::Expect(!error.empty(), "an open template failed without a message");

    CSpecification saveReader;
    SaveSpecification save;
    error.clear();
    if (!saveReader.LoadSaveTemplate(path, save, error)) fuzz::Expect(!error.empty(), "a save template failed without a message");
    return 0;
}
