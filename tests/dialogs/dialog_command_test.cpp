// SPDX-License-Identifier: MIT
// "vantrel open-dialog" and "save-dialog" as a person starts them: the series
// read first, no usable display told instead of an abrupt end, usage errors.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/files.h"
#include "support/program_run.h"
#include "support/temp_dir.h"

namespace {

TEST(DialogCommands, SeriesFirstThenTheDisplay)
{
    testing_host::TempDir folder;
    const std::string series = folder.File("series.csv"), broken = folder.File("broken.csv");
    testing_host::WriteFile(series, "title,Gauge A\nitem type,Rainfall\nunit,millimeter\nvalue type,Accumulated\n"
                                    "delete value,-9999\n2020-01-02 03:04:05,1.5\n");
    testing_host::WriteFile(broken, "title,Gauge A\nitem type,Nothing Known\n");
    const struct {
        std::vector<std::string> arguments;
        int status;
        std::string says;                  // at the start of the error output
        std::string display = "DISPLAY=";  // none
    } runs[] = {
        {{"save-dialog", broken}, 1, "vantrel: "},
        {{"save-dialog", series, "--spec", "StartRow=4;"}, 1, "The save dialog needs a display, but none is set"},
        {{"open-dialog", "--json"}, 1, "The open dialog needs a display, but the X display \":4242\"", "DISPLAY=:4242"},
        {{"open-dialog", "--spec", "x"}, 2, "usage: vantrel open-dialog [--json] [--output FILE] [--module PATH]"},
        {{"save-dialog", "a", "--json"}, 2, "usage: vantrel save-dialog SERIES [--spec SPEC] [--module PATH]"},
    };
    for (const auto &run : runs) {
        // No X server listens on display 4242: the toolkit would end the process there.
        const auto ran =
            testing_host::Vantrel(run.arguments, {"/dev/null", {"QT_QPA_PLATFORM=", "WAYLAND_DISPLAY=", run.display}});
        EXPECT_EQ(std::pair(ran.status, ran.out), std::pair(run.status, std::string())) << ran.err;
        // A failure starts with its reason, an unreadable series' without the display; usage is told somewhere.
        const size_t at = ran.err.find(run.says);
        EXPECT_TRUE(run.status == 1 ? at == 0 : at != std::string::npos) << ran.err;
        EXPECT_TRUE(run.says != "vantrel: " || ran.err.find("display") == std::string::npos) << ran.err;
    }
}

}  // namespace
