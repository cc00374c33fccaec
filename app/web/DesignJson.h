#pragma once

#include <nlohmann/json.hpp>

namespace dovrel {

// The design tables of the control and its side forms as JSON, for the page
// to lay them out: sizes and places in twips, texts in UTF-8.
class DesignJson {
public:
    // {"card": LAYOUT, "forms": {NAME: LAYOUT}}, a layout being
    // {"caption", "width", "height", "controls": [...]}.
    static nlohmann::json Build();
};

} // namespace dovrel
