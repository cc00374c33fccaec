#include "platform/Error.h"

#include <cstring>

namespace dovrel {

Utf8 ErrorText(const std::exception& failure) {
    return ValidUtf8(failure.what());
}

void ThrowSystemError(const std::string& what, const std::string& path, int err) {
    throw Error(what + " " + path + ": " + std::strerror(err));
}

} // namespace dovrel
