#include "platform/Path.h"

#include "platform/Encoding.h"

namespace dovrel {

Utf8 Path::shown() const {
    return ValidUtf8(native_);
}

Path Path::plus(std::string_view cp1255) const {
    return Path(native_ + ToUtf8(cp1255).str());
}

Path PathFromCp1255(std::string_view cp1255) {
    return Path(ToUtf8(cp1255).str());
}

} // namespace dovrel
