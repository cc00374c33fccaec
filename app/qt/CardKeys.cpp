#include "app/qt/CardKeys.h"

#include "app/qt/CardWidget.h"
#include "app/qt/FocusRing.h"

#include <QKeyEvent>
#include <QLineEdit>
#include <QToolButton>

namespace dovrel {

CardKeys::CardKeys(CardWidget& widget)
    : QObject(&widget), widget_(widget), ring_(new FocusRing(&widget)) {
    bindSearchBoxes();
    bindNavigation();
}

void CardKeys::bindSearchBoxes() {
    struct Search {
        const char* box;
        const char* label;
        bool single; // the label answers a single click
    };
    static const Search searches[] = {{"txtAccountKey", "Label1", false},
                                      {"txtReference1", "LblReference1", false},
                                      {"txtCustomerName", "Label2", false},
                                      {"txtDetails", "lblDetails", true},
                                      {"txtItemKey", "lblItemKey", false}};
    for (const Search& search : searches) {
        auto* box = qobject_cast<QLineEdit*>(widget_.widgetFor(search.box));
        if (box == nullptr)
            continue;
        connect(box, &QLineEdit::returnPressed, this, [this, search] {
            Card& card = widget_.card();
            std::string label = search.label;
            widget_.runForUser([&card, label, single = search.single] {
                if (single)
                    card.Click(label);
                else
                    card.DblClick(label);
            });
        });
    }
}

// The keys are taken before the focused widget sees them, so a text box
// or a list does not use them for itself.
void CardKeys::bindNavigation() {
    for (QWidget* child : widget_.findChildren<QWidget*>())
        if (child->focusPolicy() != Qt::NoFocus)
            child->installEventFilter(this);
}

const char* CardKeys::NavigationButton(const QKeyEvent& key) {
    Qt::KeyboardModifiers modifiers = key.modifiers() & ~Qt::KeypadModifier;
    if (modifiers == Qt::NoModifier && key.key() == Qt::Key_PageUp)
        return "PrevButt";
    if (modifiers == Qt::NoModifier && key.key() == Qt::Key_PageDown)
        return "NextButt";
    if (modifiers == Qt::ControlModifier && key.key() == Qt::Key_Home)
        return "FirstButt";
    if (modifiers == Qt::ControlModifier && key.key() == Qt::Key_End)
        return "LastButt";
    return nullptr;
}

void CardKeys::press(const std::string& name) {
    auto* button = qobject_cast<QToolButton*>(widget_.widgetFor(name));
    if (button == nullptr || !button->isEnabled())
        return;
    if (button->focusPolicy() != Qt::NoFocus)
        button->setFocus(Qt::ShortcutFocusReason);
    button->click();
}

bool CardKeys::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() != QEvent::KeyPress && event->type() != QEvent::ShortcutOverride)
        return false;
    auto* key = static_cast<QKeyEvent*>(event);
    if (const char* button = NavigationButton(*key)) {
        // Claimed as an override, so no shortcut takes it; pressed once.
        if (event->type() == QEvent::ShortcutOverride)
            event->accept();
        else
            press(button);
        return event->type() == QEvent::KeyPress;
    }
    auto* button = qobject_cast<QToolButton*>(watched);
    if (event->type() != QEvent::KeyPress || button == nullptr ||
        (key->key() != Qt::Key_Return && key->key() != Qt::Key_Enter))
        return false;
    button->click();
    return true;
}

} // namespace dovrel
