// SPDX-License-Identifier: MIT
#include "specification/bounded_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <utility>

namespace vantrel {

namespace {

class FileDescriptor {
public:
    explicit FileDescriptor(int fd) : fd_(fd) {}
    ~FileDescriptor()
    {
        if (fd_ >= 0) ::close(fd_);
    }
    FileDescriptor(const FileDescriptor &) = delete;
    FileDescriptor &operator=(const FileDescriptor &) = delete;
    int Get() const { return fd_; }

private:
    int fd_;
};

bool Refuse(std::string &reason, std::string text)
{
    reason = std::move(text);
    return false;
}

std::string KindOf(mode_t mode)
{
    if (S_ISDIR(mode)) return "is a folder, not a file";
    if (S_ISFIFO(mode)) return "is a FIFO, not a regular file";
    if (S_ISCHR(mode) || S_ISBLK(mode)) return "is a device, not a regular file";
    return "is not a regular file";
}

std::string TooLarge(size_t maxBytes) { return "is larger than " + std::to_string(maxBytes) + " bytes"; }

}  // namespace

bool ReadBoundedFile(const std::string &path, size_t maxBytes, std::string &text, std::string &reason)
{
    // Non-blocking, so that opening a FIFO with no writer returns at once
    // and the kind check below can refuse it.
    FileDescriptor file(::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
    if (file.Get() < 0) return Refuse(reason, std::strerror(errno));
    struct stat status {};
    if (::fstat(file.Get(), &status) != 0) return Refuse(reason, std::strerror(errno));
    if (!S_ISREG(status.st_mode)) return Refuse(reason, KindOf(status.st_mode));
    if (static_cast<unsigned long long>(status.st_size) > maxBytes) return Refuse(reason, TooLarge(maxBytes));

    text.clear();
    char buffer[65536];
    while (true) {
        const ssize_t n = ::read(file.Get(), buffer, sizeof buffer);
        if (n < 0 && errno == EINTR) continue;
        if (n < 0) return Refuse(reason, std::strerror(errno));
        if (n == 0) return true;
        // The file may have grown since it was measured.
        if (static_cast<size_t>(n) > maxBytes - text.size()) return Refuse(reason, TooLarge(maxBytes));
        text.append(buffer, static_cast<size_t>(n));
    }
}

}  // namespace vantrel
