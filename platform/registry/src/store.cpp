// SPDX-License-Identifier: MIT
#include "store.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>
#include <utility>

#include "failure.h"
#include "root_folder.h"
#include "tree_file.h"

namespace registry {
namespace {

namespace fs = std::filesystem;

struct TreeFile {
    fs::path path;
    const char *title;
};

TreeFile FileOf(RegistryTree tree)
{
    switch (tree) {
    case REGISTRY_CLASSES_ROOT: return {RootFolder() / "classes.reg", "classes root"};
    case REGISTRY_HOST_TREE: return {RootFolder() / "host.reg", "host tree"};
    }
    throw Failure(REGISTRY_BAD_ARGUMENT, "unknown tree " + std::to_string(static_cast<int>(tree)));
}

[[noreturn]] void FailIo(const std::string &what, const fs::path &path, int error)
{
    throw Failure(REGISTRY_IO_FAILED, what + " " + path.string() + ": " + std::strerror(error));
}

// The file's text, or nullopt when there is no file.
std::optional<std::string> ReadText(const fs::path &path)
{
    std::ifstream in(path, std::ios::binary);
    if (!in) {
        const int error = errno;
        if (error == ENOENT) return std::nullopt;
        FailIo("cannot read", path, error);
    }
    std::ostringstream text;
    text << in.rdbuf();
    if (in.bad()) FailIo("cannot read", path, errno);
    return text.str();
}

Key Parse(const TreeFile &file, const std::optional<std::string> &text)
{
    Key root;
    if (!text) return root;
    try {
        ParseTree(*text, root);
    } catch (const Failure &bad) {
        throw Failure(REGISTRY_CORRUPT, "the registry file " + file.path.string() +
                                            " is damaged and was left as it is: " + bad.what());
    }
    return root;
}

// A file descriptor closed at the end of its scope.
class Descriptor {
public:
    explicit Descriptor(int fd) : fd_(fd) {}
    ~Descriptor()
    {
        if (fd_ >= 0) close(fd_);
    }
    Descriptor(Descriptor &&other) noexcept : fd_(other.Release()) {}
    Descriptor(const Descriptor &) = delete;
    Descriptor &operator=(const Descriptor &) = delete;
    int Get() const { return fd_; }
    int Release() { return std::exchange(fd_, -1); }

private:
    int fd_;
};

// Holds the root folder's lock file exclusively, so that changes by several
// processes come one after the other.
Descriptor LockRoot(const fs::path &folder)
{
    std::error_code error;
    fs::create_directories(folder, error);
    if (error) FailIo("cannot make the registry folder", folder, error.value());
    const fs::path lockPath = folder / ".lock";
    Descriptor lock(open(lockPath.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
    if (lock.Get() < 0) FailIo("cannot open", lockPath, errno);
    while (flock(lock.Get(), LOCK_EX) != 0)
        if (errno != EINTR) FailIo("cannot lock", lockPath, errno);
    return lock;
}

// Writes text to a new file beside path and renames it over path.
void ReplaceFile(const fs::path &path, const std::string &text)
{
    std::string pattern = path.string() + ".tmp-XXXXXX";
    Descriptor fd(mkstemp(pattern.data()));
    if (fd.Get() < 0) FailIo("cannot make a temporary file beside", path, errno);
    const fs::path temporary = pattern;
    auto fail = [&](const char *what) {
        const int error = errno;
        unlink(temporary.c_str());
        FailIo(what, temporary, error);
    };
    for (size_t written = 0; written < text.size();) {
        const ssize_t n = write(fd.Get(), text.data() + written, text.size() - written);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) fail("cannot write");
        written += static_cast<size_t>(n);
    }
    if (fchmod(fd.Get(), 0644) != 0 || fsync(fd.Get()) != 0) fail("cannot write");
    if (close(fd.Release()) != 0) fail("cannot write");
    if (rename(temporary.c_str(), path.c_str()) != 0) fail("cannot rename");
}

}  // namespace

Key ReadTree(RegistryTree tree)
{
    const TreeFile file = FileOf(tree);
    return Parse(file, ReadText(file.path));
}

void UpdateTree(RegistryTree tree, const std::function<void(Key &)> &change)
{
    const TreeFile file = FileOf(tree);
    const Descriptor lock = LockRoot(file.path.parent_path());
    const auto before = ReadText(file.path);
    Key root = Parse(file, before);
    change(root);
    const std::string after = FormatTree(root, file.title);
    if (before != after) ReplaceFile(file.path, after);
}

}  // namespace registry
