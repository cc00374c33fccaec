#pragma once

#include <QObject>

class QKeyEvent;

#include <string>

namespace dovrel {

class CardWidget;
class FocusRing;

// The keyboard on a CardWidget: Page Up and Page Down step to the previous
// and next document, Ctrl+Home and Ctrl+End to the first and last; Enter in
// one of the five search boxes runs that box's search, as the mouse on its
// label does; Enter presses the focused button; a ring marks the focus.
class CardKeys : public QObject {
    Q_OBJECT

public:
    explicit CardKeys(CardWidget& widget);

    // Presses a button of the surface as the mouse would: the focus moves
    // to it first, so the field being left hears of it, then it is clicked.
    void press(const std::string& button);
    FocusRing* focusRing() const { return ring_; }

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void bindSearchBoxes();
    void bindNavigation();
    // The navigation button a key stands for, or nullptr.
    static const char* NavigationButton(const QKeyEvent& key);

    CardWidget& widget_;
    FocusRing* ring_;
};

} // namespace dovrel
