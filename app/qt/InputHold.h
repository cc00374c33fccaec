#pragma once

#include <QEvent>
#include <QObject>
#include <QPointer>

#include <memory>
#include <utility>
#include <vector>

namespace dovrel {

// Keeps the user's input away from the control while it works: between
// begin() and the matching end(), mouse, key and wheel events for any widget
// are held back, and the last end() delivers them in their order. The
// document reader runs on the user-interface thread and must not be entered
// again by a click that arrives while it scans.
class InputHold : public QObject {
    Q_OBJECT

public:
    explicit InputHold(QObject* parent = nullptr);
    ~InputHold() override;

    void begin();
    void end();
    bool holding() const { return depth_ > 0 && paused_ == 0; }
    // A modal window opened while the control works (a message, a form)
    // takes the user's input between pause() and resume().
    void pause() { ++paused_; }
    void resume() { paused_ = paused_ > 0 ? paused_ - 1 : 0; }
    // How many events wait for the end of the hold.
    int heldCount() const { return static_cast<int>(held_.size()); }

    static bool IsUserInput(QEvent::Type type);

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    int depth_ = 0;
    int paused_ = 0;
    std::vector<std::pair<QPointer<QObject>, std::unique_ptr<QEvent>>> held_;
};

// Holds the input for the life of the scope.
class InputHoldScope {
public:
    explicit InputHoldScope(InputHold& hold) : hold_(hold) { hold_.begin(); }
    ~InputHoldScope() { hold_.end(); }
    InputHoldScope(const InputHoldScope&) = delete;
    InputHoldScope& operator=(const InputHoldScope&) = delete;

private:
    InputHold& hold_;
};

// Lets the input through for the life of the scope; a null hold does nothing.
class InputPauseScope {
public:
    explicit InputPauseScope(InputHold* hold) : hold_(hold) {
        if (hold_ != nullptr)
            hold_->pause();
    }
    ~InputPauseScope() {
        if (hold_ != nullptr)
            hold_->resume();
    }
    InputPauseScope(const InputPauseScope&) = delete;
    InputPauseScope& operator=(const InputPauseScope&) = delete;

private:
    InputHold* hold_;
};

} // namespace dovrel
