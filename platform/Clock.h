#pragma once

#include <optional>

namespace dovrel {

// A day of the calendar.
struct CivilDate {
    int year = 0;
    int month = 0;
    int day = 0;
};

// Tells today's date; tests and the command line fix it.
class Clock {
public:
    virtual ~Clock() = default;
    virtual CivilDate Today() const = 0;
};

// The system's local date.
class SystemClock : public Clock {
public:
    CivilDate Today() const override;
};

class FixedClock : public Clock {
public:
    explicit FixedClock(CivilDate today) : today_(today) {}
    CivilDate Today() const override { return today_; }

private:
    CivilDate today_;
};

// The system's date until a date is fixed.
class SettableClock : public Clock {
public:
    void fix(CivilDate today) { fixed_ = today; }
    CivilDate Today() const override { return fixed_ ? *fixed_ : SystemClock().Today(); }

private:
    std::optional<CivilDate> fixed_;
};

} // namespace dovrel
