#pragma once

#include <QPointer>
#include <QWidget>

namespace dovrel {

// A frame drawn around whichever widget of the surface has the keyboard
// focus, in the highlight colour, so the focus can always be seen whatever
// the style draws. It takes no input.
class FocusRing : public QWidget {
    Q_OBJECT

public:
    explicit FocusRing(QWidget* surface);

    // The widget the ring is around, or nullptr when the focus is elsewhere.
    QWidget* target() const { return target_; }

protected:
    void paintEvent(QPaintEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void focusMoved(QWidget* now);
    void follow();

    QPointer<QWidget> target_;
};

} // namespace dovrel
