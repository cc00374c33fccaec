#include "app/qt/QtMessages.h"

#include "app/qt/QtText.h"

namespace dovrel {

namespace {

QMessageBox::StandardButton RunModal(QMessageBox& box) {
    return static_cast<QMessageBox::StandardButton>(box.exec());
}

QMessageBox::Icon BoxIcon(MsgIcon icon) {
    switch (icon) {
    case MsgIcon::Critical:
        return QMessageBox::Critical;
    case MsgIcon::Question:
        return QMessageBox::Question;
    case MsgIcon::Information:
        return QMessageBox::Information;
    }
    return QMessageBox::NoIcon;
}

} // namespace

QtMessages::QtMessages(QWidget* parent) : parent_(parent), runner_(RunModal) {}

void QtMessages::setRunner(Runner runner) {
    runner_ = runner ? std::move(runner) : Runner(RunModal);
}

// A box closed without a button (Escape, the window's close button) answers
// OK when OK is its only button and No when it asks a question.
MsgAnswer QtMessages::show(MsgIcon icon, MsgButtons buttons, const Utf8& title, const Utf8& text) {
    bool question = buttons == MsgButtons::YesNo;
    QMessageBox box(BoxIcon(icon), ToQString(title), ToQString(text),
                    question ? QMessageBox::Yes | QMessageBox::No : QMessageBox::Ok, parent_);
    box.setLayoutDirection(Qt::RightToLeft);
    box.setDefaultButton(question ? QMessageBox::Yes : QMessageBox::Ok);
    box.setEscapeButton(question ? QMessageBox::No : QMessageBox::Ok);
    InputPauseScope pause(hold_);
    QMessageBox::StandardButton pressed = runner_(box);
    if (!question)
        return MsgAnswer::Ok;
    return pressed == QMessageBox::Yes ? MsgAnswer::Yes : MsgAnswer::No;
}

} // namespace dovrel
