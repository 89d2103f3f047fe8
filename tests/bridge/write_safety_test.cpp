// SPDX-License-Identifier: MIT
// Nothing lost: an export that fails at any point of its save (a system call
// failing, the disk full, the process killed mid-write) leaves the workbook
// that was there byte for byte. The save writes a temporary file beside the
// workbook and renames it over the old one only when it is whole.
#include <gtest/gtest.h>

#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstddef>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "atomic_file.h"
#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"
#include "support/temp_dir.h"
#include "support/test_host.h"
#include "workbook/excel_obj.h"

namespace {

using automation::ComPtr;

constexpr DATE kFirstTime = 43832.0;  // 2020-01-02
constexpr double kMinute = 1.0 / 1440.0;

std::string ReadBytes(const std::string &path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

std::vector<std::string> FolderEntries(const std::filesystem::path &folder)
{
    std::vector<std::string> names;
    for (const auto &entry : std::filesystem::directory_iterator(folder)) names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

// Exports steps minutes of items series (value = step + item / 10) to path,
// silently, with the default layout; the result of WriteData.
HRESULT Export(const std::string &path, int steps, int items = 3)
{
    auto series = testing_host::MakeSeries(path, "", true);
    std::vector<DATE> times;
    for (int t = 0; t < steps; ++t) times.push_back(kFirstTime + t * kMinute);
    hostseries::SetAxisTimes(*series.Get(), times);
    for (int i = 0; i < items; ++i) {
        std::vector<double> values;
        for (int t = 0; t < steps; ++t) values.push_back(t + i / 10.0);
        hostseries::AddItemWithValues(*series.Get(), ItemDataTypeDouble, values, "Gauge " + std::to_string(i + 1));
    }
    ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    bridge->SetHostSeries(series.Get());
    return bridge->WriteData();
}

// Restores the engine's real system calls at the end of a scope.
struct RealFileOps {
    ~RealFileOps() { workbook::detail::ActiveFileOps() = workbook::detail::SystemFileOps(); }
};

class WriteSafety : public ::testing::Test {
protected:
    void SetUp() override
    {
        book = dir.File("book.xlsx");
        ASSERT_HR(S_OK, Export(book, 10));
        original = ReadBytes(book);
        ASSERT_FALSE(original.empty());
    }
    // The old workbook is there as it was, and nothing else is in its folder.
    void ExpectUntouched()
    {
        EXPECT_EQ(ReadBytes(book), original) << "the old workbook changed";
        EXPECT_EQ(FolderEntries(dir.Path()), std::vector<std::string>{"book.xlsx"});
    }

    testing_host::TempDir dir;
    std::string book;
    std::string original;
};

int FailingMkstemp(char *)
{
    errno = ENOSPC;
    return -1;
}
// Writes part of what it is given, then finds the disk full.
ssize_t WriteHalfThenDiskFull(int fd, const void *buffer, size_t count)
{
    static bool wrote = false;
    if (!wrote && count > 1) {
        wrote = true;
        return ::write(fd, buffer, count / 2);
    }
    wrote = false;
    errno = ENOSPC;
    return -1;
}
int FailingFsync(int)
{
    errno = EIO;
    return -1;
}
int FailingClose(int fd)
{
    ::close(fd);
    errno = EIO;
    return -1;
}
int FailingRename(const char *, const char *)
{
    errno = EXDEV;
    return -1;
}

TEST_F(WriteSafety, AFailureAtAnyStepOfTheSaveKeepsTheOldWorkbook)
{
    struct Step {
        const char *name;
        void (*arm)(workbook::detail::FileOps &);
        const char *failure;
    };
    const Step steps[] = {
        {"temporary file", [](workbook::detail::FileOps &ops) { ops.mkstemp = &FailingMkstemp; },
         "creating a temporary file failed: No space left on device"},
        {"write", [](workbook::detail::FileOps &ops) { ops.write = &WriteHalfThenDiskFull; },
         "writing failed: No space left on device"},
        {"flush", [](workbook::detail::FileOps &ops) { ops.fsync = &FailingFsync; }, "flushing failed: Input/output error"},
        {"close", [](workbook::detail::FileOps &ops) { ops.close = &FailingClose; }, "closing failed: Input/output error"},
        {"rename", [](workbook::detail::FileOps &ops) { ops.rename = &FailingRename; }, "renaming failed: Invalid cross-device link"},
    };
    for (const Step &step : steps) {
        SCOPED_TRACE(step.name);
        {
            RealFileOps restore;
            step.arm(workbook::detail::ActiveFileOps());
            EXPECT_HR(E_FAIL, Export(book, 2000));
        }
        EXPECT_EQ(testing_host::TakeErrorDescription(),
                  "cannot save '" + book + "': " + step.failure);
        ExpectUntouched();
    }
    // With the real calls the same export goes through.
    EXPECT_HR(S_OK, Export(book, 2000));
    EXPECT_NE(ReadBytes(book), original);
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
    EXPECT_GT(original.size(), 0u);
    ExpectUntouched();
}

TEST_F(WriteSafety, ReadOnlyFolderKeepsTheOldWorkbook)
{
    const std::filesystem::path folder = dir.Path() / "locked";
    std::filesystem::create_directory(folder);
    const std::string locked = (folder / "book.xlsx").string();
    std::filesystem::copy_file(book, locked);
    ASSERT_EQ(::chmod(dir.Path().c_str(), 0755), 0);
    ASSERT_EQ(::chmod(locked.c_str(), 0666), 0);  // the file itself may be written
    ASSERT_EQ(::chmod(folder.c_str(), 0555), 0);  // its folder may not
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        // Root writes anywhere, so the child becomes nobody.
        if (geteuid() == 0 && (setgid(65534) != 0 || setuid(65534) != 0)) _exit(4);
        const HRESULT hr = Export(locked, 500);
        const std::string error = testing_host::TakeErrorDescription();
        if (hr == S_OK) _exit(1);
        _exit(error.find("cannot save '" + locked + "': creating a temporary file failed: Permission denied") == 0 ? 0 : 2);
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ::chmod(folder.c_str(), 0755);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0) << "1: the export went through, 2: another error, 4: could not drop root";
    EXPECT_EQ(ReadBytes(locked), original);
    EXPECT_EQ(FolderEntries(folder), std::vector<std::string>{"book.xlsx"});
}

// The name a save gives its temporary file: "book.xlsx.saving-" and six
// letters or digits.
bool IsSaveTemporary(const std::string &name)
{
    const std::string prefix = "book.xlsx.saving-";
    if (name.size() != prefix.size() + 6 || name.compare(0, prefix.size(), prefix) != 0) return false;
    return std::all_of(name.begin() + static_cast<std::ptrdiff_t>(prefix.size()), name.end(),
                       [](unsigned char c) { return std::isalnum(c) != 0; });
}

// The child's write: the first piece goes to the temporary file for real,
// then the child tells the parent and waits to be killed.
int g_reportPipe = -1;
ssize_t WriteThenWaitForTheKill(int fd, const void *buffer, size_t count)
{
    const ssize_t written = ::write(fd, buffer, count / 2);
    const char ready = 'w';
    if (::write(g_reportPipe, &ready, 1) != 1) _exit(5);
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
    // The child is inside the write of the temporary file; the temporary is
    // there, half written.
    std::vector<std::string> during = FolderEntries(dir.Path());
    kill(child, SIGKILL);
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_EQ(got, 1) << "the child ended before its save wrote (status " << status << ")";
    ASSERT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL);
    EXPECT_EQ(during.size(), 2u);

    // The old workbook is whole. What the kill leaves is the half-written
    // temporary, named after the workbook with ".saving-" and six characters:
    // no workbook name, never opened by the engine, harmless.
    EXPECT_EQ(ReadBytes(book), original);
    for (const std::string &name : FolderEntries(dir.Path())) {
        if (name != "book.xlsx") {
            EXPECT_TRUE(IsSaveTemporary(name)) << name;
        }
    }
    EXPECT_EQ(FolderEntries(dir.Path()).size(), 2u);

    // The workbook reads as before, and the next export replaces it.
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error)) << error;
    ASSERT_TRUE(excel.OpenWorkbook(book, error)) << error;
    ASSERT_TRUE(excel.SelectSheet(1, error)) << error;
    EXPECT_EQ(excel.GetUsedRowCount(), 12);  // two header rows and ten steps
    excel.CloseWorkbook(0);
    excel.QuitExcel();
    EXPECT_HR(S_OK, Export(book, 20));
    EXPECT_NE(ReadBytes(book), original);
}

}  // namespace
