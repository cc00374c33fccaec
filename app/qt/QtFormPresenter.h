#pragma once

#include "app/qt/FormDialog.h"
#include "app/qt/InputHold.h"
#include "platform/Form.h"
#include "platform/Messages.h"

#include <functional>

class QWidget;

namespace dovrel {

// Shows the control's side forms modally as FormDialogs. The dialog is run by
// a replaceable function, so a test can work the dialog instead of a user; by
// default it runs modally over the parent until the form is hidden.
class QtFormPresenter : public FormPresenter {
public:
    using Runner = std::function<void(FormDialog& dialog)>;

    explicit QtFormPresenter(Messages& messages, QWidget* parent = nullptr);

    void setParent(QWidget* parent) { parent_ = parent; }
    void setRunner(Runner runner);
    // The hold on the control's input, let go while a form is open.
    void setInputHold(InputHold* hold) { hold_ = hold; }

    void ShowModal(Form& form) override;

private:
    Messages& messages_;
    QWidget* parent_;
    Runner runner_;
    InputHold* hold_ = nullptr;
};

} // namespace dovrel
