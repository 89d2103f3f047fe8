// SPDX-License-Identifier: MIT
// Nothing lost: an export that fails at any point of its save (a system call
// failing, the disk full, the process killed mid-write) leaves the workbook
// that was there byte for byte. The save writes a temporary file beside the
// workbook and renames it over the old one only when it is whole.
#include <gtest/gtest.h>

#include <signal.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <filesystem>
#include <string>
#include <vector>

#include "bridge/export_host.h"
#include "package/atomic_file.h"
#include "support/files.h"
#include "support/temp_dir.h"

namespace {

using workbook::detail::FileOps;

std::vector<std::string> FolderEntries(const std::filesystem::path &folder)
{
    std::vector<std::string> names;
    for (const auto &entry : std::filesystem::directory_iterator(folder)) names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

// Exports steps seconds of three series to path, silently, with the default layout.
HRESULT Export(const std::string &path, int steps)
{
    auto series = bridge_testing::MakeHost(path, "", steps, true);
    for (int i = 0; i < 3; ++i) bridge_testing::AddItem(*series.Get(), ItemDataTypeDouble, std::vector<double>(size_t(steps), i), "Gauge");
    return bridge_testing::Export(*series.Get());
}

class WriteSafety : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_HR(S_OK, Export(book, 10));
        original = testing_host::ReadFile(book);
        ASSERT_FALSE(original.empty());
    }
    // The old workbook is there as it was, and nothing else is in its folder.
    void ExpectUntouched()
    {
        EXPECT_EQ(testing_host::ReadFile(book), original) << "the old workbook changed";
        EXPECT_EQ(FolderEntries(dir.Path()), std::vector<std::string>{"book.xlsx"});
    }

    testing_host::TempDir dir;
    const std::string book = dir.File("book.xlsx");
    std::string original;
};

// Writes part of what it is given, then finds the disk full.
ssize_t WriteHalfThenDiskFull(int fd, const void *buffer, size_t count)
{
    static bool wrote = false;
    wrote = !wrote && count > 1;
    if (wrote) return ::write(fd, buffer, count / 2);
    errno = ENOSPC;
    return -1;
}

TEST_F(WriteSafety, AFailureAtAnyStepOfTheSaveKeepsTheOldWorkbook)
{
    struct Step {
        const char *name;
        void (*arm)(FileOps &);
        const char *failure;
    };
    const Step steps[] = {
        {"temporary file", [](FileOps &ops) { ops.mkstemp = [](char *) { return errno = ENOSPC, -1; }; },
         "creating a temporary file failed: No space left on device"},
        {"write", [](FileOps &ops) { ops.write = &WriteHalfThenDiskFull; }, "writing failed: No space left on device"},
        {"flush", [](FileOps &ops) { ops.fsync = [](int) { return errno = EIO, -1; }; }, "flushing failed: Input/output error"},
        {"close", [](FileOps &ops) { ops.close = [](int fd) { return ::close(fd), errno = EIO, -1; }; },
         "closing failed: Input/output error"},
        {"rename", [](FileOps &ops) { ops.rename = [](const char *, const char *) { return errno = EXDEV, -1; }; },
         "renaming failed: Invalid cross-device link"},
    };
    for (const Step &step : steps) {
        SCOPED_TRACE(step.name);
        step.arm(workbook::detail::ActiveFileOps());
        EXPECT_HR(E_FAIL, Export(book, 2000));
        workbook::detail::ActiveFileOps() = workbook::detail::SystemFileOps();
        EXPECT_EQ(testing_host::TakeErrorDescription(), "cannot save '" + book + "': " + step.failure);
        ExpectUntouched();
    }
    // With the real calls the same export goes through.
    EXPECT_HR(S_OK, Export(book, 2000));
    EXPECT_NE(testing_host::ReadFile(book), original);
}

TEST_F(WriteSafety, DiskFullKeepsTheOldWorkbook)
{
    // A file size limit makes the kernel refuse writes past it with EFBIG, as a
    // full disk refuses them with ENOSPC: a real failure of the write call.
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        signal(SIGXFSZ, SIG_IGN);
        const rlimit limit{64 * 1024, 64 * 1024};
        if (setrlimit(RLIMIT_FSIZE, &limit) != 0) _exit(10);
        const HRESULT hr = Export(book, 20000);
        const std::string error = testing_host::TakeErrorDescription();
        if (hr == S_OK) _exit(1);
        _exit(error == "cannot save '" + book + "': writing failed: File too large" ? 0 : 2);
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status)) << "the child died of signal " << WTERMSIG(status);
    EXPECT_EQ(WEXITSTATUS(status), 0) << "1: the export went through, 2: another error";
    ExpectUntouched();
}

// The child's write: the first half goes to the temporary file for real,
// then the child tells the parent and waits to be killed.
int g_reportPipe = -1;
ssize_t WriteThenWaitForTheKill(int fd, const void *buffer, size_t count)
{
    const ssize_t written = ::write(fd, buffer, count / 2);
    if (::write(g_reportPipe, "w", 1) != 1) _exit(5);
    for (;;) pause();
    return written;
}

TEST_F(WriteSafety, KilledMidSaveKeepsTheOldWorkbook)
{
    int report[2];
    ASSERT_EQ(pipe(report), 0);
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        close(report[0]);
        g_reportPipe = report[1];
        workbook::detail::ActiveFileOps().write = &WriteThenWaitForTheKill;
        Export(book, 50000);
        _exit(6);  // the save returned: it never reached the write
    }
    close(report[1]);
    char ready = 0;
    const ssize_t got = read(report[0], &ready, 1);
    close(report[0]);
    kill(child, SIGKILL);
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_EQ(got, 1) << "the child ended before its save wrote (status " << status << ")";
    ASSERT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL);

    // The old workbook is whole. The kill leaves the half-written temporary,
    // named so that nothing takes it for a workbook, and the empty lock file.
    EXPECT_EQ(testing_host::ReadFile(book), original);
    const auto entries = FolderEntries(dir.Path());
    ASSERT_EQ(entries.size(), 3u);
    EXPECT_EQ(entries[0], ".book.xlsx.vantrel-lock");
    EXPECT_EQ(entries[1], "book.xlsx");
    const std::string prefix = "book.xlsx.saving-";
    EXPECT_TRUE(entries[2].size() == prefix.size() + 6 && entries[2].rfind(prefix, 0) == 0 &&
                std::all_of(entries[2].begin() + long(prefix.size()), entries[2].end(), [](char c) { return std::isalnum(c); }))
        << entries[2];

    // The leftover doesn't stand in the way of the next export.
    EXPECT_HR(S_OK, Export(book, 20));
    EXPECT_NE(testing_host::ReadFile(book), original);
}

}  // namespace
