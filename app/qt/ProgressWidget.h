#pragma once

#include <QElapsedTimer>
#include <QWidget>

#include <memory>

#include "platform/Controls.h"

namespace dovrel {

// The progress bar of file scans: the silver frame with the fill growing
// inside it. A scan runs on the user-interface thread and may move the fill
// thousands of times, so while a scan runs the bar is painted at most
// kMaxRepaintsPerSecond times a second, and only when the fill has moved.
class ProgressWidget : public QWidget {
    Q_OBJECT

public:
    static constexpr int kMaxRepaintsPerSecond = 30;
    static constexpr int kRepaintIntervalMs =
        (1000 + kMaxRepaintsPerSecond - 1) / kMaxRepaintsPerSecond;

    ProgressWidget(Shape& frame, Shape& fill, QWidget* parent = nullptr);
    ~ProgressWidget() override { *alive_ = false; }

    // How often the bar has been painted; tests count the repaints of a scan.
    int paintCount() const { return paintCount_; }
    // Called by the host around a scan: while scanning, the bar paints itself
    // (and lets the window system's own events through) at the limited rate;
    // otherwise it waits for the event loop as every widget does.
    void setScanning(bool scanning);

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    std::shared_ptr<bool> alive_ = std::make_shared<bool>(true); // false once gone
    void fillMoved();

    Shape& frame_;
    Shape& fill_;
    QElapsedTimer sinceRepaint_;
    bool scanning_ = false;
    int paintCount_ = 0;
    Connection fillMoved_;
};

} // namespace dovrel
