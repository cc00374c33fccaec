#pragma once

#include "platform/ControlDesign.h"

#include <cstdint>
#include <vector>

namespace dovrel {

constexpr int32_t kCardDesignWidth = 10440;
constexpr int32_t kCardDesignHeight = 7680;
constexpr const char* kCardFont = "Arial";

// Every child control of the viewer, labels and frames included, in tab order.
const std::vector<ControlDesign>& CardSurface();
// The design of one control, or nullptr.
const ControlDesign* FindDesign(const std::string& name);

} // namespace dovrel
