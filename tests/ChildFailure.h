#pragma once

// The failure of a piece of work as its Error's description: run here, or in
// a child process whose changes to itself (its user, its file size limit)
// end with it. For the fault tests of Dovrel's own files.

#include "platform/Error.h"

#include <functional>
#include <string>

#include <sys/wait.h>
#include <unistd.h>

namespace dovrel::test {

// Runs work and gives its Error's description ("" when it succeeded).
inline std::string FailureOf(const std::function<void()>& work) {
    try {
        work();
        return "";
    } catch (const Error& e) {
        return e.what();
    }
}

// The failure of work run in a child process after prepare (which returns
// false when the child cannot be set up), so that what the child changes about
// itself (its user, its file size limit) ends with it.
inline std::string FailureInChild(const std::function<bool()>& prepare,
                                  const std::function<void()>& work) {
    int fds[2];
    if (pipe(fds) != 0)
        return "pipe failed";
    pid_t child = fork();
    if (child == 0) {
        std::string answer = prepare() ? "-" + FailureOf(work) : "cannot prepare the child";
        ssize_t written = write(fds[1], answer.data(), answer.size());
        _exit(written == static_cast<ssize_t>(answer.size()) ? 0 : 1);
    }
    close(fds[1]);
    std::string answer;
    char buffer[512];
    for (ssize_t n; (n = read(fds[0], buffer, sizeof buffer)) > 0;)
        answer.append(buffer, static_cast<size_t>(n));
    close(fds[0]);
    waitpid(child, nullptr, 0);
    return answer.starts_with("-") ? answer.substr(1) : "child failed: " + answer;
}

// A child's preparation: as root, become "nobody", so that file modes apply.
inline bool BecomeNobody() {
    return geteuid() != 0 || (setgid(65534) == 0 && setuid(65534) == 0);
}

} // namespace dovrel::test
