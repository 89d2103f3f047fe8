// SPDX-License-Identifier: MIT
// Runs a program as a user would from a shell: arguments as given, standard
// input from a file (or /dev/null), standard output and error captured.
#pragma once

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <string>
#include <string_view>
#include <vector>

#include "support/files.h"
#include "support/temp_dir.h"

namespace testing_host {

struct ProgramRun {
    int status = -1;  // the exit status, or -1 when the program didn't exit by itself
    std::string out;
    std::string err;
};

struct RunOptions {
    std::string input = "/dev/null";       // the file read as standard input
    std::vector<std::string> environment;  // NAME=VALUE entries over this process's own
};

inline ProgramRun RunProgram(const std::string &program, const std::vector<std::string> &arguments,
                             const RunOptions &options = {})
{
    TempDir dir;
    const std::string outPath = dir.File("stdout");
    const std::string errPath = dir.File("stderr");

    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, 0, options.input.c_str(), O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 1, outPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    posix_spawn_file_actions_addopen(&actions, 2, errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);

    std::vector<char *> argv{const_cast<char *>(program.c_str())};
    for (const std::string &argument : arguments) argv.push_back(const_cast<char *>(argument.c_str()));
    argv.push_back(nullptr);
    // The given entries replace this process's entries of the same name.
    std::vector<std::string> environment = options.environment;
    for (char **entry = environ; *entry; ++entry) {
        const std::string_view inherited(*entry);
        const std::string_view name = inherited.substr(0, inherited.find('='));
        bool replaced = false;
        for (const std::string &given : options.environment)
            replaced = replaced || given.substr(0, given.find('=')) == name;
        if (!replaced) environment.emplace_back(inherited);
    }
    std::vector<char *> envp;
    for (std::string &entry : environment) envp.push_back(entry.data());
    envp.push_back(nullptr);

    ProgramRun run;
    pid_t pid = 0;
    const int spawned = posix_spawn(&pid, program.c_str(), &actions, nullptr, argv.data(), envp.data());
    posix_spawn_file_actions_destroy(&actions);
    if (spawned != 0) {
        run.err = "could not start " + program;
        return run;
    }
    int raw = 0;
    while (waitpid(pid, &raw, 0) < 0) {
    }
    run.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
    run.out = ReadFile(outPath);
    run.err = ReadFile(errPath);
    return run;
}

#ifdef VANTREL_PROGRAM
// The built command-line host.
inline ProgramRun Vantrel(const std::vector<std::string> &arguments, const RunOptions &options = {})
{
    return RunProgram(VANTREL_PROGRAM, arguments, options);
}
#endif

}  // namespace testing_host
