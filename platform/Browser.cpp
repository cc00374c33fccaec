#include "platform/Browser.h"

#include "platform/Error.h"

#include <cstring>
#include <thread>

#include <spawn.h>
#include <sys/wait.h>

extern char** environ;

namespace dovrel {

void XdgOpenBrowser::Open(const Path& path) {
    std::string program = "xdg-open";
    std::string argument = path.native();
    char* argv[] = {program.data(), argument.data(), nullptr};
    pid_t pid = 0;
    int error = posix_spawnp(&pid, program.c_str(), nullptr, nullptr, argv, environ);
    if (error != 0)
        throw Error("Could not start the browser (xdg-open): " + std::string(std::strerror(error)));
    // Reaped in the background, so that the control does not wait for the
    // browser and a finished xdg-open leaves no zombie behind.
    std::thread([pid] { waitpid(pid, nullptr, 0); }).detach();
}

} // namespace dovrel
