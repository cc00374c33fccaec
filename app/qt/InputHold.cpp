#include "app/qt/InputHold.h"

#include <QCoreApplication>

namespace dovrel {

InputHold::InputHold(QObject* parent) : QObject(parent) {}

InputHold::~InputHold() {
    if (depth_ > 0 && QCoreApplication::instance() != nullptr)
        QCoreApplication::instance()->removeEventFilter(this);
}

bool InputHold::IsUserInput(QEvent::Type type) {
    switch (type) {
    case QEvent::MouseButtonPress:
    case QEvent::MouseButtonRelease:
    case QEvent::MouseButtonDblClick:
    case QEvent::KeyPress:
    case QEvent::KeyRelease:
    case QEvent::ShortcutOverride:
    case QEvent::Shortcut:
    case QEvent::Wheel:
    case QEvent::ContextMenu:
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
        return true;
    default:
        return false;
    }
}

void InputHold::begin() {
    if (depth_++ == 0 && QCoreApplication::instance() != nullptr)
        QCoreApplication::instance()->installEventFilter(this);
}

// The held events go back to the queue, so they reach their widgets after
// everything that is already waiting there, as they would have.
void InputHold::end() {
    if (depth_ == 0 || --depth_ > 0)
        return;
    if (QCoreApplication::instance() != nullptr)
        QCoreApplication::instance()->removeEventFilter(this);
    auto held = std::move(held_);
    held_.clear();
    for (auto& [receiver, event] : held)
        if (receiver != nullptr)
            QCoreApplication::postEvent(receiver, event.release());
}

bool InputHold::eventFilter(QObject* watched, QEvent* event) {
    if (!holding() || !IsUserInput(event->type()) || !watched->isWidgetType())
        return false;
    held_.emplace_back(QPointer<QObject>(watched), std::unique_ptr<QEvent>(event->clone()));
    event->accept();
    return true;
}

} // namespace dovrel
