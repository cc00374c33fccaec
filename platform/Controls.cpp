#include "platform/Controls.h"

#include "platform/Error.h"

#include <algorithm>

namespace dovrel {

const std::string& ComboBox::List(int32_t index) const {
    if (index < 0 || index >= ListCount())
        throw Error("Invalid list index " + std::to_string(index) + " for " + name());
    return entries_[static_cast<size_t>(index)];
}

void ComboBox::Clear() {
    entries_.clear();
    if (index_ != -1) {
        index_ = -1;
        changed();
    }
}

void ComboBox::setListIndex(int32_t index) {
    if (index < -1 || index >= ListCount())
        throw Error("Invalid list position " + std::to_string(index) + " for " + name());
    if (index == index_)
        return;
    index_ = index;
    changed();
}

std::string ComboBox::Text() const {
    return index_ < 0 ? std::string() : entries_[static_cast<size_t>(index_)];
}

void TextBox::setSelStart(int32_t start) {
    if (start < 0)
        throw Error("Invalid selection start " + std::to_string(start) + " for " + name());
    selStart_ = std::min(start, static_cast<int32_t>(text_.size()));
    selLength_ = std::min(selLength_, static_cast<int32_t>(text_.size()) - selStart_);
}

void TextBox::setSelLength(int32_t length) {
    if (length < 0)
        throw Error("Invalid selection length " + std::to_string(length) + " for " + name());
    selLength_ = std::min(length, static_cast<int32_t>(text_.size()) - selStart_);
}

std::string TextBox::SelText() const {
    return text_.substr(static_cast<size_t>(selStart_), static_cast<size_t>(selLength_));
}

void CheckBox::setValue(int32_t value) {
    if (value < 0 || value > 2)
        throw Error("Invalid check box value " + std::to_string(value) + " for " + name());
    if (value == value_)
        return;
    value_ = value;
    changed();
}

} // namespace dovrel
