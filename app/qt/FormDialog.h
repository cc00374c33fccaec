#pragma once

#include "app/qt/ControlBinder.h"
#include "control/Surface.h"
#include "platform/Form.h"
#include "platform/Messages.h"

#include <QDialog>

#include <string>
#include <vector>

namespace dovrel {

// How a side form looks: its caption (code page 1255), its design size and
// its controls, in twips.
struct FormLayout {
    std::string caption;
    int32_t width = 0;
    int32_t height = 0;
    std::vector<ControlDesign> controls;
};

// A side form as a dialog: one widget per control of its layout, bound to the
// form's control of the same name (a design with no model, such as a caption
// label, is drawn as designed), right to left. The user's clicks go to the
// form's handlers; when a handler hides the form the dialog closes, and the
// window's close button asks the form (QueryClose).
class FormDialog : public QDialog {
    Q_OBJECT

public:
    FormDialog(Form& form, const FormLayout& layout, Messages& messages, QWidget* parent = nullptr);

    Form& form() const { return form_; }
    QWidget* widgetFor(const std::string& name) const { return binder_->widgetFor(name); }

    // The layout of the side forms the control knows by name; any other form
    // gets its controls stacked one under another.
    static FormLayout LayoutOf(const Form& form);

    void reject() override;

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void run(const std::function<void()>& step);
    void closeIfHidden();

    Form& form_;
    Messages& messages_;
    ControlBinder* binder_ = nullptr;
};

} // namespace dovrel
