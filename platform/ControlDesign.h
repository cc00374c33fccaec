#pragma once

#include "platform/Controls.h"

#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

// How one child control of the viewer looks at design time: enough for a
// front end to lay the control out without knowing anything else. Positions
// and sizes are in twips (1/1440 inch); texts are code page 1255.
struct ControlDesign {
    std::string name;
    ControlKind kind = ControlKind::Label;
    std::string caption; // labels, buttons and check boxes
    std::string toolTip;
    int32_t left = 0, top = 0, width = 0, height = 0;
    std::vector<std::string> entries; // drop-down lists, in order
    std::string text;                 // a text box's initial text
    std::string labelFor;             // a caption label: the control it names
    std::string picture;              // a button drawn as a picture: which one
    bool grey = false;                // button-face background (read-only look)
    bool bold = false;                // the clickable search labels
    uint32_t foreColor = 0;           // 0xRRGGBB
};

// One control of a design table: its name, kind, caption (given in UTF-8)
// and place in twips; the other fields are left at their defaults.
ControlDesign Design(std::string name, ControlKind kind, const char* captionUtf8, int32_t left,
                     int32_t top, int32_t width, int32_t height);

} // namespace dovrel
