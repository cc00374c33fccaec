#include "platform/Path.h"

#include "platform/Encoding.h"

#include <unicode/utf8.h>

namespace dovrel {

std::string Path::shown() const {
    return ValidUtf8(native_);
}

Path Path::plus(std::string_view cp1255) const {
    return Path(native_ + ToUtf8(cp1255));
}

Path PathFromCp1255(std::string_view cp1255) {
    return Path(ToUtf8(cp1255));
}

} // namespace dovrel
