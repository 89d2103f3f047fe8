// SPDX-License-Identifier: MIT
// Helpers shared by the fuzz targets.
#pragma once

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>

namespace fuzz {

// Stops the run with a report: a broken promise is a finding, like a crash.
[[noreturn]] inline void Violated(const char *what)
{
    std::fprintf(stderr, "fuzz check failed: %s\n", what);
    std::abort();
}

inline void Expect(bool condition, const char *what)
{
    if (!condition) Violated(what);
}

// Inputs that must pass through a file go to one file of this process,
// rewritten for each input, in the folder of temporary files.
class ScratchFile {
public:
    explicit ScratchFile(const char *suffix)
    {
        const char *folder = std::getenv("TMPDIR");
        path_ = std::string(folder && *folder ? folder : "/tmp") + "/vantrel-fuzz-" +
                std::to_string(::getpid()) + suffix;
    }
    ~ScratchFile() { std::remove(path_.c_str()); }
    ScratchFile(const ScratchFile &) = delete;
    ScratchFile &operator=(const ScratchFile &) = delete;

    const std::string &Write(std::string_view bytes)
    {
        std::FILE *file = std::fopen(path_.c_str(), "wb");
        if (!file) Violated("cannot write the scratch file");
        if (!bytes.empty()) std::fwrite(bytes.data(), 1, bytes.size(), file);
        std::fclose(file);
        return path_;
    }

private:
    std::string path_;
};

}  // namespace fuzz
