#pragma once

#include <cstddef>
#include <string_view>

namespace dovrel {

// The page's own files (HTML, CSS, JavaScript), embedded at build time.
struct PageAsset {
    std::string_view name;
    std::string_view bytes;
};

// The embedded file of that name ("index.html"), or nullptr.
const PageAsset* FindPageAsset(std::string_view name);

} // namespace dovrel
