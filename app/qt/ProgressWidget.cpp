#include "app/qt/ProgressWidget.h"

#include <QCoreApplication>
#include <QPainter>

#include <algorithm>

namespace dovrel {

ProgressWidget::ProgressWidget(Shape& frame, Shape& fill, QWidget* parent)
    : QWidget(parent), frame_(frame), fill_(fill) {
    setObjectName(QString::fromStdString(frame.name()));
    setAttribute(Qt::WA_OpaquePaintEvent);
    fillMoved_ = fill_.changed.connect([this, alive = alive_] {
        if (*alive)
            fillMoved();
    });
}

void ProgressWidget::setScanning(bool scanning) {
    scanning_ = scanning;
    if (scanning) {
        sinceRepaint_.start();
    } else {
        update();
    }
}

// While scanning, a moved fill is painted at once when the last repaint is old
// enough; the moves in between are taken up by the next one. Window-system
// events (exposure, the window manager's checks) are handled at the same
// moments so the window does not look frozen; the user's input waits.
void ProgressWidget::fillMoved() {
    if (!scanning_) {
        update();
        return;
    }
    if (sinceRepaint_.isValid() && sinceRepaint_.elapsed() < kRepaintIntervalMs)
        return;
    sinceRepaint_.restart();
    if (isVisible())
        repaint();
    QCoreApplication::processEvents(QEventLoop::ExcludeUserInputEvents);
}

void ProgressWidget::paintEvent(QPaintEvent*) {
    ++paintCount_;
    QPainter painter(this);
    painter.fillRect(rect(), QColor(0xC0, 0xC0, 0xC0));
    int span = std::max(1, frame_.Width());
    int shown = std::clamp(fill_.Width(), 0, span);
    int fillWidth = static_cast<int>(static_cast<long long>(width()) * shown / span);
    int fillLeft = static_cast<int>(static_cast<long long>(width()) *
                                    std::clamp(fill_.Left() - frame_.Left(), 0, span) / span);
    if (fillWidth > 0)
        painter.fillRect(QRect(fillLeft, 0, fillWidth, height()), QColor(0x00, 0x00, 0x80));
    painter.setPen(QColor(0x80, 0x80, 0x80));
    painter.drawRect(rect().adjusted(0, 0, -1, -1));
}

} // namespace dovrel
