#pragma once

#include "app/qt/InputHold.h"
#include "platform/Messages.h"

#include <QMessageBox>

#include <functional>

class QWidget;

namespace dovrel {

// The control's message boxes as QMessageBox: the exact title and text, the
// icon and buttons asked for, laid out right to left. The box is run by a
// replaceable function, so a test can look at it and answer it instead of a
// user; by default it runs modally over the parent.
class QtMessages : public Messages {
public:
    using Runner = std::function<QMessageBox::StandardButton(QMessageBox& box)>;

    explicit QtMessages(QWidget* parent = nullptr);

    void setParent(QWidget* parent) { parent_ = parent; }
    void setRunner(Runner runner);
    // The hold on the control's input, let go while a box is open.
    void setInputHold(InputHold* hold) { hold_ = hold; }

    MsgAnswer show(MsgIcon icon, MsgButtons buttons, const Utf8& title, const Utf8& text) override;

private:
    QWidget* parent_;
    Runner runner_;
    InputHold* hold_ = nullptr;
};

} // namespace dovrel
