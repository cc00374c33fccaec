#pragma once

#include "platform/Path.h"

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dovrel {

// The control holds its paths (CompDir, DBPath, PicPath, LogoFile, the path
// box) as code page 1255 text, and that code page cannot hold every name the
// system allows (Cyrillic, say). A path given from outside is shown in the
// control as its 1255 text ("?" for what the code page lacks) and kept here,
// so the text leads back to the very same native path. Text that was never
// given this way is converted as it stands.
class PathNames {
public:
    // The control's text for the path; a path the code page cannot hold is
    // remembered under that text.
    std::string text(const Path& path);

    // The native path the control's text names. A remembered text, or one
    // that begins with a remembered text followed by a separator, gives the
    // remembered path (with the rest converted).
    Path native(std::string_view cp1255) const;

private:
    std::vector<std::pair<std::string, Path>> kept_;
};

} // namespace dovrel
