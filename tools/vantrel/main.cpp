// SPDX-License-Identifier: MIT
// vantrel: runs the bridge module from the command line, as a host would.
// "vantrel --help" lists the commands; "vantrel COMMAND --help" tells one.
#include "command_line.h"
#include "output_file.h"

int main(int argc, char **argv)
{
    vantrel_cli::StandardOutput standardOutput;
    return standardOutput.Finish(vantrel_cli::RunCommandLine(argc, argv));
}
