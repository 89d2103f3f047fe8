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
        // A write that fails is told with its reason as the program ends
        // (StandardOutput::Finish).
        write(std::cout);
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

StandardOutput::StandardOutput() : previous_(std::cout.rdbuf(this)) { setp(buffer_, buffer_ + sizeof buffer_); }

StandardOutput::~StandardOutput()
{
    Drain();
    std::cout.rdbuf(previous_);
}

StandardOutput::int_type StandardOutput::overflow(int_type c)
{
    if (Drain() != 0) return traits_type::eof();
    if (traits_type::eq_int_type(c, traits_type::eof())) return traits_type::not_eof(c);
    *pptr() = traits_type::to_char_type(c);
    pbump(1);
    return c;
}

int StandardOutput::sync() { return Drain(); }

int StandardOutput::Drain()
{
    const char *next = pbase();
    while (next < pptr() && failure_ == 0) {
        const ssize_t n = ::write(STDOUT_FILENO, next, size_t(pptr() - next));
        if (n > 0) next += n;
        else if (n < 0 && errno != EINTR) failure_ = errno;
    }
    setp(buffer_, buffer_ + sizeof buffer_);
    return failure_ == 0 ? 0 : -1;
}

int StandardOutput::Finish(int status)
{
    std::cout.flush();
    if (failure_ == 0 || status != 0) return status;
    std::cerr << "vantrel: cannot write the standard output" << Reason(failure_) << "\n";
    return 1;
}

}  // namespace vantrel_cli
