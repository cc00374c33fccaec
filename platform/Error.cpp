#include "platform/Error.h"

#include <cstring>

namespace dovrel {

void ThrowSystemError(const std::string& what, const std::string& path, int err) {
    throw Error(what + " " + path + ": " + std::strerror(err));
}

} // namespace dovrel
