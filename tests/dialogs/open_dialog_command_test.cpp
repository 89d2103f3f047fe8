// SPDX-License-Identifier: MIT
// "vantrel open-dialog" as a person starts it: where no display can be had it
// says so and fails, instead of ending abruptly; a wrong option is a usage error.
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

Outcome RunProgram(const std::string &arguments)
{
    testing_host::TempDir folder;
    const std::string command = "env -u DISPLAY -u WAYLAND_DISPLAY -u QT_QPA_PLATFORM " +
                                std::string(VANTREL_PROGRAM) + " " + arguments + " >" + folder.File("out") +
                                " 2>" + folder.File("err");
    const int raw = std::system(command.c_str());
    Outcome outcome;
    outcome.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
    outcome.out = Slurp(folder.File("out"));
    outcome.err = Slurp(folder.File("err"));
    return outcome;
}

TEST(OpenDialogCommand, NoDisplayAndUsage)
{
    const Outcome headless = RunProgram("open-dialog --json");
    EXPECT_EQ(headless.status, 1);
    EXPECT_EQ(headless.out, "");
    EXPECT_EQ(headless.err,
              "The open dialog needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, or name a Qt "
              "platform in QT_QPA_PLATFORM.\n");

    const Outcome usage = RunProgram("open-dialog --spec x");
    EXPECT_EQ(usage.status, 2);
    EXPECT_NE(usage.err.find("usage: vantrel open-dialog [--json] [--output FILE] [--module PATH]"),
              std::string::npos);
}

}  // namespace
