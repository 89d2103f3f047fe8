// SPDX-License-Identifier: MIT
#include "package/atomic_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <optional>
#include <system_error>
#include <vector>

#include "errors.h"
#include "package/interrupted_save.h"

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

// Refuses a file this process may not write, before anything is written: the
// rename would replace it all the same. Root may write any file, so a file
// without any write bit counts as read-only too.
void CheckWritable(const std::string &path, const std::string &file, const struct stat &st)
{
    if (::access(file.c_str(), W_OK) == 0 && (st.st_mode & 0222) != 0) return;
    Fail(E_ACCESSDENIED, "cannot save '" + path + "': the file is read-only. Make it writable, or save the "
                         "workbook under another name");
}

}  // namespace

std::string FileBehindLinks(const std::string &path)
{
    constexpr int kMaxLinks = 40;  // as the system's own limit on a chain of links
    std::filesystem::path file = path;
    std::error_code ec;
    for (int links = 0; std::filesystem::is_symlink(file, ec); ++links) {
        const std::filesystem::path target = std::filesystem::read_symlink(file, ec);
        if (ec || links == kMaxLinks)
            Fail(E_FAIL, "cannot save '" + path + "': its symbolic link can't be followed" +
                             (ec ? ": " + ec.message() : std::string(" (too many links)")));
        file = target.is_absolute() ? target : (file.parent_path() / target).lexically_normal();
    }
    return file.string();
}

void ReplaceFileAtomically(const std::string &givenPath, std::string_view bytes)
{
    const detail::FileOps &ops = detail::ActiveFileOps();
    const std::string path = FileBehindLinks(givenPath);
    struct stat old;
    const bool replacing = ::stat(path.c_str(), &old) == 0;
    if (replacing) CheckWritable(givenPath, path, old);
    std::string templ = path + ".saving-XXXXXX";
    std::vector<char> name(templ.begin(), templ.end());
    name.push_back('\0');
    std::optional<SignalsHeld> held(std::in_place);
    int fd = ops.mkstemp(name.data());
    if (fd < 0) SaveFailed(path, "creating a temporary file", errno);
    const char *tmp = name.data();
    // From here until the rename, SIGINT and SIGTERM remove the temporary
    // first; one that came while it was being made is taken now.
    const TemporaryFileGuard removedOnSignal(tmp);
    held.reset();
    auto abandon = [&](const char *step, int err) {
        if (fd >= 0) ops.close(fd);
        ops.unlink(tmp);
        SaveFailed(path, step, err);
    };
    if (replacing) {
        ::fchmod(fd, old.st_mode & 07777);
        // Only a privileged process may give a file away; others keep their own.
        if (::fchown(fd, old.st_uid, old.st_gid) != 0) {
            if (errno != EPERM) abandon("keeping the owner", errno);
            if (::fchown(fd, static_cast<uid_t>(-1), old.st_gid) != 0 && errno != EPERM)
                abandon("keeping the group", errno);
        }
    } else {
        const mode_t mask = ::umask(0);
        ::umask(mask);
        ::fchmod(fd, 0666 & ~mask);
    }
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
