#include "platform/Form.h"

namespace dovrel {

Control* Form::findControl(const std::string& name) const {
    for (Control* control : controls_)
        if (control->name() == name)
            return control;
    return nullptr;
}

void ClosingFormPresenter::ShowModal(Form& form) {
    form.Show();
    form.QueryClose();
}

} // namespace dovrel
