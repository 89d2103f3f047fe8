// SPDX-License-Identifier: MIT
// Where the program's printed results go, told when they can't all be
// written (a full disk, a full device) rather than lost in silence.
#pragma once

#include <functional>
#include <ostream>
#include <streambuf>
#include <string>

namespace vantrel_cli {

// Writes what `write` prints to standard output for "" or "-", else to the
// file output. For a file, throws std::runtime_error with the reason when not
// all of it could be written, and removes the file it made or truncated, so
// that no empty or cut-off file stays behind; standard output tells its
// failure as the program ends (StandardOutput::Finish).
void WriteOutput(const std::string &output, const std::function<void(std::ostream &)> &write);

// std::cout through a buffer that keeps the reason of a write that failed,
// for as long as this object lives.
class StandardOutput : public std::streambuf {
public:
    StandardOutput();
    ~StandardOutput() override;
    StandardOutput(const StandardOutput &) = delete;
    StandardOutput &operator=(const StandardOutput &) = delete;
    // Flushes at the end of the program: the exit status, 1 (after a message
    // on stderr) when a command that succeeded could not print all it had to.
    int Finish(int status);

protected:
    int_type overflow(int_type c) override;
    int sync() override;

private:
    int Drain();
    std::streambuf *previous_;
    char buffer_[1 << 16];
    int failure_ = 0;  // errno of the first write that failed
};

}  // namespace vantrel_cli
