// SPDX-License-Identifier: MIT
// The specification string reader on arbitrary text: every key, the numeric
// reading, the date/time layout and the template reference.
#include <cstddef>
#include <cstdint>
#include <string>

#include "fuzz_input.h"
#include "specification/specification.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const std::string spec(reinterpret_cast<const char *>(data), size);
    CSpecification specification;
    for (int key = -1; key <= kParsingTypeCount; ++key) {
        std::string name;
        const bool known = specification.GetKeyName(key, name);
        fuzz::Expect(known == (key >= 0 && key < kParsingTypeCount), "GetKeyName answers for 0 to 21 only");
        std::string value = "untouched";
        if (specification.GetKeyValue(spec, key, value)) {
            fuzz::Expect(known, "a value for an unknown key");
            fuzz::Expect(value.size() <= spec.size(), "a value longer than the string");
            fuzz::Expect(spec.find(name) != std::string::npos, "a value for a key that isn't in the string");
        } else {
            fuzz::Expect(value == "untouched", "a failed GetKeyValue changed the value");
        }
        int number = 0;
        specification.GetKeyValueInt(spec, key, number);
    }
    int column = -7, columnCount = 0, mode = -7;
    std::string format;
    fuzz::Expect(specification.GetDateTimeLayout(spec, column, columnCount, mode, format),
                 "GetDateTimeLayout is always true");
    fuzz::Expect(mode == -7 || (mode >= 0 && mode <= 2), "a layout mode outside 0 to 2");
    fuzz::Expect(columnCount >= 0, "a negative column count");
    std::string path;
    if (specification.GetTemplateReference(spec, path))
        fuzz::Expect(spec.find("TemplateFilePath") != std::string::npos, "a template reference without its key");
    return 0;
}
