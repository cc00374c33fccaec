#pragma once

#include "platform/Controls.h"
#include "platform/Variant.h"

#include <cstdint>
#include <string>

namespace dovrel {

class SettingsStore;

// Moves one property of a control (Kind 1 Text, 2 ListIndex, 3 Value) to the
// settings store (Action 1) or from it (Action 2). Another kind or action does
// nothing; a control without that property is an Error.
void BindSetting(SettingsStore& store, uint8_t Action, const std::string& AppName,
                 const std::string& Section, const std::string& Key, Control& Ctl, uint8_t Kind,
                 const Variant& Default);

} // namespace dovrel
