// SPDX-License-Identifier: MIT
#include "output_file.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <fstream>
#include <iostream>
#include <stdexcept>

namespace vantrel_cli {
namespace {

// errno when the stream left one; the reason stays untold otherwise.
std::string Reason(int err) { return err != 0 ? std::string(": ") + std::strerror(err) : std::string(); }

}  // namespace

void WriteOutput(const std::string &output, const std::function<void(std::ostream &)> &write)
{
    if (output.empty() || output == "-") {
        write(std::cout);
        errno = 0;
        std::cout.flush();
        if (!std::cout) throw std::runtime_error("cannot write the standard output" + Reason(errno));
        return;
    }
    // Only a regular file (or none yet) is removed on failure, never a device or a pipe.
    struct stat st;
    const bool removable = ::stat(output.c_str(), &st) != 0 || S_ISREG(st.st_mode);
    std::ofstream file(output, std::ios::binary | std::ios::trunc);
    if (!file) throw std::runtime_error("cannot write " + output + Reason(errno));
    errno = 0;
    write(file);
    file.flush();
    int err = errno;
    if (file) {
        file.close();
        err = errno;
    }
    if (file) return;
    if (removable) ::unlink(output.c_str());
    throw std::runtime_error("cannot write " + output + Reason(err));
}

int FinishStandardOutput(int status)
{
    errno = 0;
    std::cout.flush();
    if (std::cout) return status;
    const int err = errno;
    std::cerr << "vantrel: cannot write the standard output" << Reason(err) << "\n";
    return status == 0 ? 1 : status;
}

}  // namespace vantrel_cli
