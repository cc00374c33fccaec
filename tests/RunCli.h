#pragma once

// Runs the built `dovrel` command without a shell, its streams through files
// (a pipe could fill up), for the tests of the command line.

#include "TestCompany.h"

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <string>
#include <vector>

namespace dovrel::test {

struct CliResult {
    int code = -1; // the exit code; -2 when the command was killed for taking too long
    std::string out;
    std::string err;
};

// The command with these arguments and standard input, in this process's
// environment. A command still running after timeoutSeconds is killed.
// Standard output goes to stdoutPath when one is given (it is not read back).
inline CliResult RunCli(const std::vector<std::string>& args, const std::string& input = "",
                        int timeoutSeconds = 60, const std::string& stdoutPath = "") {
    TempDir dir;
    std::string in = (dir.path() / "in").string(),
                out = stdoutPath.empty() ? (dir.path() / "out").string() : stdoutPath,
                err = (dir.path() / "err").string();
    std::ofstream(in, std::ios::binary) << input;
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_addopen(&files, 0, in.c_str(), O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&files, 1, out.c_str(), O_WRONLY | O_CREAT, 0600);
    posix_spawn_file_actions_addopen(&files, 2, err.c_str(), O_WRONLY | O_CREAT, 0600);
    std::vector<std::string> words{DOVREL_CLI};
    words.insert(words.end(), args.begin(), args.end());
    std::vector<char*> argv;
    for (std::string& word : words)
        argv.push_back(word.data());
    argv.push_back(nullptr);
    CliResult result;
    pid_t pid = 0;
    int status = 0;
    if (posix_spawn(&pid, DOVREL_CLI, &files, nullptr, argv.data(), environ) == 0) {
        pid_t done = 0;
        for (int waited = 0; (done = waitpid(pid, &status, WNOHANG)) == 0; ++waited) {
            if (waited == timeoutSeconds * 100)
                break;
            usleep(10'000);
        }
        if (done == 0) {
            kill(pid, SIGKILL);
            waitpid(pid, &status, 0);
            result.code = -2;
        } else if (WIFEXITED(status)) {
            result.code = WEXITSTATUS(status);
        }
    }
    posix_spawn_file_actions_destroy(&files);
    result.out = stdoutPath.empty() ? ReadAll(out) : "";
    result.err = ReadAll(err);
    return result;
}

} // namespace dovrel::test
