#pragma once

#include <deque>
#include <exception>
#include <string>
#include <vector>

namespace dovrel {

enum class MsgIcon { Critical, Question, Information };
enum class MsgButtons { Ok, YesNo };
enum class MsgAnswer { Ok, Yes, No };

// The modal message boxes of the control. Title and text are code page 1255.
class Messages {
public:
    virtual ~Messages() = default;
    virtual MsgAnswer show(MsgIcon icon, MsgButtons buttons, const std::string& title,
                           const std::string& text) = 0;
};

// Shows a failure under the title: the failure's description is UTF-8 text
// (as every error's), turned here, and only here, into the box's code page.
void ShowFailure(Messages& messages, const std::string& titleUtf8, const std::exception& failure);

// A message box that nobody sees: it records every message and answers
// questions from a queue (an empty queue answers "No"). Tests and the
// automation host use it.
class RecordedMessages : public Messages {
public:
    struct Shown {
        MsgIcon icon;
        MsgButtons buttons;
        std::string title;
        std::string text;
    };

    MsgAnswer show(MsgIcon icon, MsgButtons buttons, const std::string& title,
                   const std::string& text) override;

    void queueAnswer(MsgAnswer answer) { answers_.push_back(answer); }
    const std::vector<Shown>& shown() const { return shown_; }
    std::vector<Shown> take();

private:
    std::vector<Shown> shown_;
    std::deque<MsgAnswer> answers_;
};

} // namespace dovrel
