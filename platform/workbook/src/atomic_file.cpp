// SPDX-License-Identifier: MIT
#include "atomic_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <vector>

#include "errors.h"

namespace workbook {
namespace detail {

FileOps SystemFileOps()
{
    return FileOps{&::mkstemp, &::write, &::fsync, &::close, &::rename, &::unlink};
}

FileOps &ActiveFileOps()
{
    static FileOps ops = SystemFileOps();
    return ops;
}

}  // namespace detail

namespace {

std::string FolderOf(const std::string &path)
{
    size_t slash = path.rfind('/');
    if (slash == std::string::npos) return ".";
    if (slash == 0) return "/";
    return path.substr(0, slash);
}

[[noreturn]] void SaveFailed(const std::string &path, const char *step, int err)
{
    Fail(err == EACCES || err == EPERM || err == EROFS ? E_ACCESSDENIED : E_FAIL,
         "cannot save '" + path + "': " + step + " failed: " + std::strerror(err));
}

// Mode for the new file: the old file's, or what a new file would get.
mode_t TargetMode(const std::string &path)
{
    struct stat st;
    if (::stat(path.c_str(), &st) == 0) return st.st_mode & 07777;
    mode_t mask = ::umask(0);
    ::umask(mask);
    return 0666 & ~mask;
}

}  // namespace

void ReplaceFileAtomically(const std::string &path, std::string_view bytes)
{
    const detail::FileOps &ops = detail::ActiveFileOps();
    std::string templ = path + ".saving-XXXXXX";
    std::vector<char> name(templ.begin(), templ.end());
    name.push_back('\0');
    int fd = ops.mkstemp(name.data());
    if (fd < 0) SaveFailed(path, "creating a temporary file", errno);
    const char *tmp = name.data();
    auto abandon = [&](const char *step, int err) {
        if (fd >= 0) ops.close(fd);
        ops.unlink(tmp);
        SaveFailed(path, step, err);
    };
    ::fchmod(fd, TargetMode(path));
    size_t done = 0;
    while (done < bytes.size()) {
        ssize_t n = ops.write(fd, bytes.data() + done, bytes.size() - done);
        if (n < 0) {
            if (errno == EINTR) continue;
            abandon("writing", errno);
        }
        if (n == 0) abandon("writing", EIO);
        done += static_cast<size_t>(n);
    }
    if (ops.fsync(fd) != 0) abandon("flushing", errno);
    int closing = ops.close(fd);
    fd = -1;
    if (closing != 0) abandon("closing", errno);
    if (ops.rename(tmp, path.c_str()) != 0) abandon("renaming", errno);
    // Make the rename itself durable.
    int dir = ::open(FolderOf(path).c_str(), O_RDONLY | O_DIRECTORY);
    if (dir >= 0) {
        ::fsync(dir);
        ::close(dir);
    }
}

}  // namespace workbook
