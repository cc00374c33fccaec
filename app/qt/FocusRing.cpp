#include "app/qt/FocusRing.h"

#include <QApplication>
#include <QEvent>
#include <QPainter>

namespace dovrel {

namespace {

constexpr int kRingWidth = 2;

} // namespace

FocusRing::FocusRing(QWidget* surface) : QWidget(surface) {
    setAttribute(Qt::WA_TransparentForMouseEvents);
    setFocusPolicy(Qt::NoFocus);
    hide();
    connect(qApp, &QApplication::focusChanged, this,
            [this](QWidget*, QWidget* now) { focusMoved(now); });
}

void FocusRing::focusMoved(QWidget* now) {
    if (target_ != nullptr)
        target_->removeEventFilter(this);
    QWidget* surface = parentWidget();
    target_ = now != nullptr && now != surface && surface->isAncestorOf(now) ? now : nullptr;
    if (target_ == nullptr) {
        hide();
        return;
    }
    target_->installEventFilter(this);
    follow();
}

void FocusRing::follow() {
    if (target_ == nullptr || !target_->isVisible()) {
        hide();
        return;
    }
    QPoint corner = target_->mapTo(parentWidget(), QPoint(0, 0));
    setGeometry(
        QRect(corner, target_->size()).adjusted(-kRingWidth, -kRingWidth, kRingWidth, kRingWidth));
    show();
    raise();
}

bool FocusRing::eventFilter(QObject* watched, QEvent* event) {
    if (watched == target_ && (event->type() == QEvent::Move || event->type() == QEvent::Resize ||
                               event->type() == QEvent::Hide || event->type() == QEvent::Show))
        follow();
    return false;
}

void FocusRing::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    QPen pen(palette().color(QPalette::Highlight), kRingWidth);
    pen.setJoinStyle(Qt::MiterJoin);
    painter.setPen(pen);
    painter.drawRect(QRectF(rect()).adjusted(1, 1, -1, -1));
}

} // namespace dovrel
