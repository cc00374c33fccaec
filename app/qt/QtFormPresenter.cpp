#include "app/qt/QtFormPresenter.h"

namespace dovrel {

namespace {

void RunModal(FormDialog& dialog) {
    dialog.exec();
}

} // namespace

QtFormPresenter::QtFormPresenter(Messages& messages, QWidget* parent)
    : messages_(messages), parent_(parent), runner_(RunModal) {}

void QtFormPresenter::setRunner(Runner runner) {
    runner_ = runner ? std::move(runner) : Runner(RunModal);
}

// The form is shown until one of its handlers hides it or the user closes
// the window; a dialog that ends otherwise closes the form as its window's
// close button would.
void QtFormPresenter::ShowModal(Form& form) {
    InputPauseScope pause(hold_);
    form.Show();
    FormDialog dialog(form, FormDialog::LayoutOf(form), messages_, parent_);
    dialog.setWindowModality(Qt::ApplicationModal);
    runner_(dialog);
    if (form.Visible())
        form.QueryClose();
    if (form.Visible())
        form.Hide();
}

} // namespace dovrel
