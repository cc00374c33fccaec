#include "platform/ControlDesign.h"

#include "platform/Encoding.h"

namespace dovrel {

ControlDesign Design(std::string name, ControlKind kind, const char* captionUtf8, int32_t left,
                     int32_t top, int32_t width, int32_t height) {
    ControlDesign d;
    d.name = std::move(name);
    d.kind = kind;
    d.caption = FromUtf8(Utf8(captionUtf8));
    d.left = left;
    d.top = top;
    d.width = width;
    d.height = height;
    return d;
}

} // namespace dovrel
