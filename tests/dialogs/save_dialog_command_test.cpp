// SPDX-License-Identifier: MIT
// "vantrel save-dialog" as a person starts it: the series is read before any
// window; where no display can be had, or the X display named doesn't
// answer, it says so and fails instead of ending abruptly.
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <sys/wait.h>

#include "support/temp_dir.h"

namespace {

struct Outcome {
    int status = -1;
    std::string out, err;
};

std::string Slurp(const std::string &path)
{
    std::ifstream file(path);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

Outcome RunProgram(const std::string &environment, const std::string &arguments)
{
    testing_host::TempDir folder;
    const std::string command = "env -u DISPLAY -u WAYLAND_DISPLAY -u QT_QPA_PLATFORM " + environment + " " +
                                std::string(VANTREL_PROGRAM) + " " + arguments + " >" + folder.File("out") +
                                " 2>" + folder.File("err");
    const int raw = std::system(command.c_str());
    Outcome outcome;
    outcome.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
    outcome.out = Slurp(folder.File("out"));
    outcome.err = Slurp(folder.File("err"));
    return outcome;
}

TEST(SaveDialogCommand, SeriesFirstThenTheDisplay)
{
    testing_host::TempDir folder;
    const std::string series = folder.File("series.csv");
    std::ofstream(series) << "title,Gauge A\n"
                             "item type,Rainfall\n"
                             "unit,millimeter\n"
                             "value type,Accumulated\n"
                             "delete value,-9999\n"
                             "2020-01-02 03:04:05,1.5\n";
    const std::string broken = folder.File("broken.csv");
    std::ofstream(broken) << "title,Gauge A\nitem type,Nothing Known\n";

    const Outcome unreadable = RunProgram("", "save-dialog " + broken);
    EXPECT_EQ(unreadable.status, 1);
    EXPECT_EQ(unreadable.err.rfind("vantrel: ", 0), 0u) << unreadable.err;
    EXPECT_EQ(unreadable.err.find("display"), std::string::npos) << unreadable.err;

    const Outcome headless = RunProgram("", "save-dialog " + series + " --spec 'StartRow=4;'");
    EXPECT_EQ(headless.status, 1);
    EXPECT_EQ(headless.out, "");
    EXPECT_EQ(headless.err,
              "The save dialog needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, or name a Qt "
              "platform in QT_QPA_PLATFORM.\n");

    // No X server listens on display 4242: Qt would end the process there.
    const Outcome unreachable = RunProgram("DISPLAY=:4242", "save-dialog " + series);
    EXPECT_EQ(unreachable.status, 1);
    EXPECT_EQ(unreachable.err,
              "The save dialog needs a display, but the X display \":4242\" named in DISPLAY doesn't answer.\n");
    const Outcome openUnreachable = RunProgram("DISPLAY=:4242", "open-dialog");
    EXPECT_EQ(openUnreachable.status, 1);
    EXPECT_EQ(openUnreachable.err,
              "The open dialog needs a display, but the X display \":4242\" named in DISPLAY doesn't answer.\n");

    for (const char *usage : {"save-dialog", "save-dialog a b", "save-dialog a --json"}) {
        const Outcome wrong = RunProgram("", usage);
        EXPECT_EQ(wrong.status, 2) << usage;
        EXPECT_NE(wrong.err.find("usage: vantrel save-dialog SERIES [--spec SPEC] [--module PATH]"), std::string::npos)
            << usage;
    }
}

}  // namespace
