#include "app/session/CardMembers.h"

#include "app/session/HostArgs.h"
#include "app/session/StateJson.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/ListControls.h"

#include <cstdint>
#include <limits>

namespace dovrel {

namespace {

constexpr int64_t kInt32Min = std::numeric_limits<int32_t>::min();
constexpr int64_t kInt32Max = std::numeric_limits<int32_t>::max();

} // namespace

void CardMembers::Set(Card& card, const std::string& name, const nlohmann::json& value) {
    if (!SetPub(card, name, value))
        SetControl(Find(card, name), value);
}

bool CardMembers::SetPub(Card& card, const std::string& name, const nlohmann::json& value) {
    if (name == "PubACTLocation")
        card.PubACTLocation =
            static_cast<int32_t>(HostArgs::Integer(value, name, kInt32Min, kInt32Max));
    else if (name == "PubPrevLocation")
        card.PubPrevLocation =
            static_cast<int32_t>(HostArgs::Integer(value, name, kInt32Min, kInt32Max));
    else if (name == "PubSearchBy")
        card.PubSearchBy = HostArgs::Text(value, name);
    else if (name == "PubSearchValue")
        card.PubSearchValue = HostArgs::Scalar(value, name);
    else if (name == "ReadingOrder")
        card.setReadingOrder(static_cast<int16_t>(HostArgs::Integer(value, name, 0, 1)));
    else
        return false;
    return true;
}

void CardMembers::SetControl(Control& control, const nlohmann::json& value) {
    const std::string& name = control.name();
    switch (control.kind()) {
    case ControlKind::TextBox:
        static_cast<TextBox&>(control).setText(HostArgs::Text(value, name));
        return;
    case ControlKind::DirList:
        static_cast<DirListBox&>(control).setPath(HostArgs::Text(value, name));
        return;
    case ControlKind::ComboBox:
    case ControlKind::ListBox:
    case ControlKind::DriveList:
        static_cast<ComboBox&>(control).setListIndex(
            static_cast<int32_t>(HostArgs::Integer(value, name, -1, kInt32Max)));
        return;
    case ControlKind::CheckBox:
        static_cast<CheckBox&>(control).setValue(
            static_cast<int32_t>(HostArgs::Integer(value, name, 0, 2)));
        return;
    default:
        throw Error(name + " cannot be set");
    }
}

void CardMembers::Select(Card& card, const std::string& name, const HostArgs& args) {
    Control& control = Find(card, name);
    switch (control.kind()) {
    case ControlKind::ComboBox:
    case ControlKind::ListBox:
    case ControlKind::DriveList:
        args.expectCount(2);
        static_cast<ComboBox&>(control).setListIndex(
            static_cast<int32_t>(args.integer(1, "list position", -1, kInt32Max)));
        return;
    case ControlKind::TextBox: {
        args.expectCount(3);
        auto& box = static_cast<TextBox&>(control);
        auto start = static_cast<int32_t>(args.integer(1, "selection start", 0, kInt32Max));
        auto length = static_cast<int32_t>(args.integer(2, "selection length", 0, kInt32Max));
        box.setSelLength(0);
        box.setSelStart(start);
        box.setSelLength(length);
        return;
    }
    case ControlKind::Grid:
        args.expectCount(2);
        static_cast<Grid&>(control).setRow(
            static_cast<int32_t>(args.integer(1, "row", 0, kInt32Max)));
        return;
    default:
        throw Error(name + " cannot be selected");
    }
}

void CardMembers::SetCell(Card& card, const std::string& name, const HostArgs& args) {
    Control& control = Find(card, name);
    if (control.kind() != ControlKind::Grid)
        throw Error(name + " has no cells");
    static_cast<Grid&>(control).setTextMatrix(
        static_cast<int32_t>(args.integer(1, "row", 0, kInt32Max)),
        static_cast<int32_t>(args.integer(2, "column", 0, kInt32Max)), args.text(3, "text"));
}

nlohmann::json CardMembers::Get(Card& card, const std::string& name) {
    if (name == "PubACTLocation")
        return card.PubACTLocation;
    if (name == "PubPrevLocation")
        return card.PubPrevLocation;
    if (name == "PubSearchBy")
        return StateJson::Text(card.PubSearchBy);
    if (name == "PubSearchValue")
        return StateJson::FromVariant(card.PubSearchValue);
    if (name == "ReadingOrder")
        return card.ReadingOrder();
    return StateJson::ControlValue(Find(card, name));
}

Form& CardMembers::FindForm(Card& card, const std::string& name) {
    auto& forms = card.shared().Forms;
    auto found = forms.find(name);
    if (found == forms.end() || !found->second)
        throw Error("Form " + name + " is not loaded");
    return *found->second;
}

Control& CardMembers::Find(Card& card, const std::string& name) {
    size_t dot = name.find('.');
    Control* control = dot == std::string::npos
                           ? card.findControl(name)
                           : FindForm(card, name.substr(0, dot)).findControl(name.substr(dot + 1));
    if (control == nullptr)
        throw Error("Unknown member or control: " + name);
    return *control;
}

} // namespace dovrel
