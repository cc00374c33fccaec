#pragma once

#include "platform/Controls.h"

#include <string>
#include <vector>

namespace dovrel {

// A side form of the control: a name, its child controls and its load step.
// A form is shown modally by a FormPresenter; the form's own buttons hide it
// (Hide) and the window's close button closes it (QueryClose).
class Form {
public:
    explicit Form(std::string name) : name_(std::move(name)) {}
    virtual ~Form() = default;
    Form(const Form&) = delete;
    Form& operator=(const Form&) = delete;

    const std::string& name() const { return name_; }
    const std::vector<Control*>& controls() const { return controls_; }
    Control* findControl(const std::string& name) const;

    // Runs once, when the form is first loaded.
    virtual void Load() {}
    // The user pressed one of the form's controls.
    virtual void Click(const std::string&) {}
    virtual void DblClick(const std::string&) {}
    // The window's close button: the form is hidden without confirming.
    virtual void QueryClose() { Hide(); }

    bool Visible() const { return visible_; }
    void Show() { visible_ = true; }
    void Hide() { visible_ = false; }

protected:
    void addControl(Control& control) { controls_.push_back(&control); }

private:
    std::string name_;
    std::vector<Control*> controls_;
    bool visible_ = false;
};

// Shows forms modally: returns when the user has closed the form.
class FormPresenter {
public:
    virtual ~FormPresenter() = default;
    virtual void ShowModal(Form& form) = 0;
};

// A presenter for hosts without a user: the form is shown and closed at once,
// as if the user had closed its window without doing anything.
class ClosingFormPresenter : public FormPresenter {
public:
    void ShowModal(Form& form) override;
};

} // namespace dovrel
