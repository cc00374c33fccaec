#pragma once

#include "platform/ControlDesign.h"

#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

// The design of the picture settings form "frmItemPics": every control, frames
// and caption labels included, in tab order; positions in twips, texts in code
// page 1255. Hebrew captions stand to the right of the fields they name.
constexpr int32_t kItemPicsDesignWidth = 8520;
constexpr int32_t kItemPicsDesignHeight = 6660;
// The form's caption, in UTF-8 (FromUtf8 gives the code page 1255 text).
constexpr const char* kItemPicsCaptionUtf8 = "הגדרות נוספות";

const std::vector<ControlDesign>& ItemPicsDesign();
// The design of one control of the form, or nullptr.
const ControlDesign* FindItemPicsDesign(const std::string& name);

} // namespace dovrel
