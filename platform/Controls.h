#pragma once

#include "platform/Signal.h"

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace dovrel {

// Plain models of the form controls. All logic works on these; a front end
// binds real widgets to them and adds nothing to the logic. Texts are code
// page 1255 bytes.

enum class ControlKind {
    TextBox,
    ComboBox,
    CheckBox,
    Label,
    Shape,
    Button,
    Grid,
    ListBox,   // a list shown open, entries one per line
    DriveList, // a drop-down of the mounted file systems
    DirList    // a directory tree showing one path
};

class Control {
public:
    explicit Control(std::string name, ControlKind kind) : name_(std::move(name)), kind_(kind) {}
    virtual ~Control() = default;
    Control(const Control&) = delete;
    Control& operator=(const Control&) = delete;

    const std::string& name() const { return name_; }
    ControlKind kind() const { return kind_; }
    // The text a label, button or check box shows (code page 1255). Setting a
    // different caption announces it, so a view can show it at once.
    const std::string& Caption() const { return caption_; }
    void setCaption(std::string caption) {
        if (caption == caption_)
            return;
        caption_ = std::move(caption);
        captionChanged();
    }

    Signal<> captionChanged;

private:
    std::string name_;
    ControlKind kind_;
    std::string caption_;
};

// A text box. Setting a different text announces the change, as typing would;
// setting the same text does nothing. The selection is a start and a length
// in bytes; a new text leaves nothing selected, with the caret at the start.
class TextBox : public Control {
public:
    explicit TextBox(std::string name, std::string text = {})
        : Control(std::move(name), ControlKind::TextBox), text_(std::move(text)) {}

    const std::string& Text() const { return text_; }
    void setText(std::string text) {
        if (text == text_)
            return;
        text_ = std::move(text);
        selStart_ = 0;
        selLength_ = 0;
        changed();
    }

    int32_t SelStart() const { return selStart_; }
    int32_t SelLength() const { return selLength_; }
    // A start past the end moves to the end; a length past the end stops
    // there. Negative values are refused with an error.
    void setSelStart(int32_t start);
    void setSelLength(int32_t length);
    // The selected part of the text.
    std::string SelText() const;

    Signal<> changed;

private:
    std::string text_;
    int32_t selStart_ = 0;
    int32_t selLength_ = 0;
};

// A rectangle shape; the progress bar is two of them, and only the width of
// the filled one moves. Listeners hear only real changes, so a scan that
// updates the width every few records repaints at most once per distinct width.
class Shape : public Control {
public:
    Shape(std::string name, int32_t left, int32_t top, int32_t width, int32_t height)
        : Control(std::move(name), ControlKind::Shape), left_(left), top_(top), width_(width),
          height_(height) {}

    int32_t Left() const { return left_; }
    int32_t Top() const { return top_; }
    int32_t Width() const { return width_; }
    int32_t Height() const { return height_; }
    void setWidth(int32_t width) {
        if (width == width_)
            return;
        width_ = width;
        changed();
    }

    Signal<> changed;

private:
    int32_t left_, top_, width_, height_;
};

} // namespace dovrel

namespace dovrel {

// A drop-down list: its entries and the selected position (-1 for none).
// A position outside the list is refused with an error, as the list would.
class ComboBox : public Control {
public:
    explicit ComboBox(std::string name, ControlKind kind = ControlKind::ComboBox)
        : Control(std::move(name), kind) {}

    int32_t ListCount() const { return static_cast<int32_t>(entries_.size()); }
    const std::string& List(int32_t index) const;
    void AddItem(std::string entry) { entries_.push_back(std::move(entry)); }
    void Clear();

    int32_t ListIndex() const { return index_; }
    void setListIndex(int32_t index);
    // The text of the selected entry, or "" with no selection.
    std::string Text() const;

    Signal<> changed;

private:
    std::vector<std::string> entries_;
    int32_t index_ = -1;
};

// A check box: 0 unchecked, 1 checked, 2 greyed. Other values are refused.
class CheckBox : public Control {
public:
    explicit CheckBox(std::string name) : Control(std::move(name), ControlKind::CheckBox) {}

    int32_t Value() const { return value_; }
    void setValue(int32_t value);

    Signal<> changed;

private:
    int32_t value_ = 0;
};

// A caption label or a command button: a caption and nothing else; what a
// click does belongs to the control or form that owns them.
class Label : public Control {
public:
    explicit Label(std::string name) : Control(std::move(name), ControlKind::Label) {}
};

class Button : public Control {
public:
    explicit Button(std::string name) : Control(std::move(name), ControlKind::Button) {}
};

} // namespace dovrel
