#include "platform/SettingsBinding.h"

#include "platform/Error.h"
#include "platform/SettingsStore.h"

namespace dovrel {

namespace {

enum PropertyKind : uint8_t { kText = 1, kListIndex = 2, kValue = 3 };

[[noreturn]] void NoSuchProperty(const Control& control) {
    throw Error("Object doesn't support this property or method: " + control.name());
}

std::string ReadProperty(const Control& control, uint8_t kind) {
    if (kind == kText && control.kind() == ControlKind::TextBox)
        return static_cast<const TextBox&>(control).Text();
    if (kind == kListIndex && control.kind() == ControlKind::ComboBox)
        return std::to_string(static_cast<const ComboBox&>(control).ListIndex());
    if (kind == kValue && control.kind() == ControlKind::CheckBox)
        return std::to_string(static_cast<const CheckBox&>(control).Value());
    NoSuchProperty(control);
}

// Assigns the stored text as the control would take it: a list position and
// a check-box value from their decimal digits; the control refuses values
// it cannot hold.
void WriteProperty(Control& control, uint8_t kind, const std::string& text) {
    if (kind == kText && control.kind() == ControlKind::TextBox)
        static_cast<TextBox&>(control).setText(text);
    else if (kind == kListIndex && control.kind() == ControlKind::ComboBox)
        static_cast<ComboBox&>(control).setListIndex(Variant(text).toInt32());
    else if (kind == kValue && control.kind() == ControlKind::CheckBox)
        static_cast<CheckBox&>(control).setValue(Variant(text).toInt32());
    else
        NoSuchProperty(control);
}

} // namespace

void BindSetting(SettingsStore& store, uint8_t Action, const std::string& AppName,
                 const std::string& Section, const std::string& Key, Control& Ctl, uint8_t Kind,
                 const Variant& Default) {
    if (Kind < kText || Kind > kValue)
        return;
    if (Action == 1)
        store.SaveSetting(AppName, Section, Key, ReadProperty(Ctl, Kind));
    else if (Action == 2)
        WriteProperty(Ctl, Kind, store.GetSetting(AppName, Section, Key, Default.toText()));
}

} // namespace dovrel
