#include "app/cli/CompanyDir.h"

#include "app/cli/ExitCode.h"
#include "platform/FileSystem.h"

#include <cerrno>
#include <cstring>

#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

void CheckCompanyDir(const Path& dir) {
    std::string native = ResolvePath(dir).native();
    struct stat info {};
    if (dir.empty() || (::stat(native.c_str(), &info) != 0 && errno == ENOENT))
        throw CommandError(kExitNotFound, "Company directory not found: " + dir.shown().str());
    if (info.st_mode == 0)
        throw Error("Cannot open the company directory " + dir.shown().str() + ": " +
                    std::strerror(errno));
    if (!S_ISDIR(info.st_mode))
        throw CommandError(kExitNotFound, "Company directory not found: " + dir.shown().str() +
                                              " is not a directory");
    if (::access(native.c_str(), R_OK | X_OK) != 0)
        throw Error("Cannot read the company directory " + dir.shown().str() + ": " +
                    std::strerror(errno));
}

} // namespace dovrel
