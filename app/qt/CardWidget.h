#pragma once

#include "app/qt/ControlBinder.h"
#include "app/qt/InputHold.h"
#include "app/qt/ProgressWidget.h"
#include "control/Card.h"

#include <QWidget>

#include <exception>
#include <functional>
#include <memory>
#include <vector>

namespace dovrel {

// Hosts one Card: a real widget for every control of its surface, placed as
// designed (twips scaled to the screen), right to left, in Arial or a Hebrew
// sans font where Arial is missing. Every user event goes to the control's
// own handler; the widget adds no behaviour.
class CardWidget : public QWidget {
    Q_OBJECT

public:
    CardWidget(const CardServices& services, ModuleState& shared, QWidget* parent = nullptr);
    ~CardWidget() override;

    Card& card() { return *card_; }
    QWidget* widgetFor(const std::string& name) const { return binder_->widgetFor(name); }
    ProgressWidget* progress() const { return progress_; }
    InputHold& inputHold() { return hold_; }
    bool busy() const { return depth_ > 0; }

    // Runs one call into the control for its host: the user's input waits
    // meanwhile, the progress bar paints at its limited rate, and the widgets
    // show the models' state afterwards. A failure reaches the caller; a call
    // made while another is running is refused, so the reader is never
    // entered twice.
    void call(const std::function<void()>& step);
    // Runs one step for the user (a click, a typed text): as call, but a
    // failure is shown in a message box titled "תקלה" with its description.
    // A step that comes while a call runs waits for its end.
    void runForUser(const std::function<void()>& step);

    // The font of the surface: Arial where the system has it, otherwise a
    // sans font with Hebrew letters.
    static QFont SurfaceFont();

    // The design's size, scaled to the screen: the comfortable minimum. A
    // larger widget is laid out anchored to the right, the grid taking the
    // extra width and height.
    QSize sizeHint() const override;
    QSize minimumSizeHint() const override { return sizeHint(); }

protected:
    void resizeEvent(QResizeEvent* event) override;

private:
    void bindSurface();
    void runStep(const std::function<void()>& step);
    void runWaitingSteps();
    void reportFailure(const std::exception& failure);

    std::unique_ptr<Card> card_;
    InputHold hold_;
    ControlBinder* binder_ = nullptr;
    ProgressWidget* progress_ = nullptr;
    int depth_ = 0;
    std::vector<std::function<void()>> waiting_;
};

} // namespace dovrel
