// SPDX-License-Identifier: MIT
// "vantrel" where others share its files: exports of one workbook at once, a
// workbook a spreadsheet program has open, a signal in the middle of a save,
// and output to a full disk or device.
#include <gtest/gtest.h>
#include <signal.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <string>
#include <thread>

#include "support/files.h"
#include "support/program_run.h"
#include "support/temp_dir.h"

namespace {

using testing_host::Vantrel;
namespace fs = std::filesystem;
const char kLayout[] = "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;";

// A series as import prints it: steps a minute apart, two items.
std::string Series(int steps)
{
    std::string text = "title,a,b\nitem type,,\nunit,,\nvalue type,Instantaneous,Instantaneous\ndelete value,-9999\n";
    const auto start = std::chrono::sys_days(std::chrono::year(2020) / 1 / 1);
    for (int step = 0; step < steps; ++step) {
        const auto day = std::chrono::floor<std::chrono::days>(start + std::chrono::minutes(step));
        const std::chrono::year_month_day date(day);
        char line[64];
        std::snprintf(line, sizeof line, "%04d-%02u-%02u %02d:%02d:00,%d,%d.5\n", int(date.year()), unsigned(date.month()),
                      unsigned(date.day()), step / 60 % 24, step % 60, step % 997, step % 13);
        text += line;
    }
    return text;
}

// What is left in the folder besides the given files.
std::string Leftovers(const testing_host::TempDir &dir, std::initializer_list<std::string> expected)
{
    std::string left;
    for (const auto &entry : fs::directory_iterator(dir.File("")))
        if (std::find(expected.begin(), expected.end(), entry.path().filename()) == expected.end())
            left += entry.path().filename().string() + " ";
    return left;
}

TEST(ExportSharing, ExportsOfOneWorkbookAtOnceEndOneAfterTheOther)
{
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("s.csv"), Series(3000));
    // Three at once on a missing workbook, rounds over: without the lock one
    // of them now and then reads the file another is writing.
    const std::string three = "for r in 1 2 3 4 5; do rm -f b.xlsx; for i in 1 2 3; do \"$0\" export s.csv b.xlsx "
                              "--spec '' & done; for i in 1 2 3; do wait -n || echo failed; done; done";
    const auto run = testing_host::RunProgram("/bin/bash", {"-c", "cd " + dir.File("") + " && " + three, VANTREL_PROGRAM});
    EXPECT_EQ(run.out + run.err, "");
    EXPECT_EQ(Leftovers(dir, {"s.csv", "b.xlsx"}), "");
    EXPECT_EQ(Vantrel({"import", dir.File("b.xlsx"), "--spec", kLayout}).out, Series(3000));
}

TEST(ExportSharing, AWorkbookAnotherProgramHasOpenIsRefusedAndKept)
{
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("s.csv"), Series(3));
    ASSERT_EQ(Vantrel({"export", dir.File("s.csv"), dir.File("b.xlsx"), "--spec", ""}).status, 0);
    const std::string before = testing_host::ReadFile(dir.File("b.xlsx"));
    testing_host::WriteFile(dir.File(".~lock.b.xlsx#"), "someone,host,/home/someone;\n");
    const auto run = Vantrel({"export", dir.File("s.csv"), dir.File("b.xlsx"), "--spec", ""});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.err, "cannot save '" + dir.File("b.xlsx") + "': another program has the workbook open (its lock file "
              "'.~lock.b.xlsx#' is beside it). Close the workbook there and try again; a lock file that no program "
              "holds any more may be deleted\n");
    EXPECT_EQ(testing_host::ReadFile(dir.File("b.xlsx")), before);
    EXPECT_EQ(Leftovers(dir, {"s.csv", "b.xlsx", ".~lock.b.xlsx#"}), "");
}

TEST(ExportSharing, SigtermInTheMiddleOfASaveLeavesNoTemporaryFile)
{
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("s.csv"), Series(300000));
    bool killedInSave = false;
    for (int attempt = 0; attempt < 3 && !killedInSave; ++attempt) {
        const pid_t pid = fork();
        if (pid == 0) {
            execl(VANTREL_PROGRAM, VANTREL_PROGRAM, "export", dir.File("s.csv").c_str(), dir.File("b.xlsx").c_str(),
                  "--spec", "", static_cast<char *>(nullptr));
            _exit(127);
        }
        for (bool saving = false; !saving && waitpid(pid, nullptr, WNOHANG) == 0;) {
            for (const auto &entry : fs::directory_iterator(dir.File("")))
                saving = saving || entry.path().filename().string().starts_with("b.xlsx.saving-");
            if (saving) kill(pid, SIGTERM);
            else std::this_thread::sleep_for(std::chrono::microseconds(200));
        }
        int status = 0;
        waitpid(pid, &status, 0);
        killedInSave = WIFSIGNALED(status) && WTERMSIG(status) == SIGTERM && !fs::exists(dir.File("b.xlsx"));
        EXPECT_EQ(Leftovers(dir, {"s.csv", "b.xlsx"}), "");
        fs::remove(dir.File("b.xlsx"));
    }
    EXPECT_TRUE(killedInSave);
}

TEST(ExportSharing, OutputThatCanNotAllBeWrittenFailsAndLeavesNoFile)
{
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("s.csv"), Series(200));
    ASSERT_EQ(Vantrel({"export", dir.File("s.csv"), dir.File("b.xlsx"), "--spec", ""}).status, 0);
    const std::string import = "\"$0\" import b.xlsx --spec '" + std::string(kLayout) + "'";
    const struct {
        std::string command, err;
    } cases[] = {
        {"ulimit -f 1; trap '' XFSZ; " + import + " --output out.csv", "vantrel: cannot write out.csv: File too large\n"},
        {import + " --output /dev/full", "vantrel: cannot write /dev/full: No space left on device\n"},
        {import + " --json > /dev/full", "vantrel: cannot write the standard output: No space left on device\n"},
        {"\"$0\" cells b.xlsx > /dev/full", "vantrel: cannot write the standard output: No space left on device\n"},
        {"\"$0\" inspect b.xlsx --spec '" + std::string(kLayout) + "' > /dev/full", "vantrel: cannot write the standard output: No space left on device\n"},
    };
    for (const auto &c : cases) {
        const auto run = testing_host::RunProgram("/bin/bash", {"-c", "cd " + dir.File("") + " && " + c.command, VANTREL_PROGRAM});
        EXPECT_EQ(run.status, 1) << c.command;
        EXPECT_EQ(run.err, c.err) << c.command;
        EXPECT_EQ(Leftovers(dir, {"s.csv", "b.xlsx"}), "") << c.command;
    }
}

}  // namespace
