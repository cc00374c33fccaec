#pragma once

#include "platform/Encoding.h"

#include <deque>
#include <exception>
#include <string>
#include <vector>

namespace dovrel {

enum class MsgIcon { Critical, Question, Information };
enum class MsgButtons { Ok, YesNo };
enum class MsgAnswer { Ok, Yes, No };

// The modal message boxes of the control. Title and text are UTF-8, as a
// person reads them: the control turns its own code page 1255 texts with
// ToUtf8 where it calls the box.
class Messages {
public:
    virtual ~Messages() = default;
    virtual MsgAnswer show(MsgIcon icon, MsgButtons buttons, const Utf8& title,
                           const Utf8& text) = 0;
};

// Shows a failure's description (ErrorText) under the title.
void ShowFailure(Messages& messages, const Utf8& title, const std::exception& failure);

// A message box that nobody sees: it records every message and answers
// questions from a queue (an empty queue answers "No"). Tests and the
// automation host use it.
class RecordedMessages : public Messages {
public:
    struct Shown {
        MsgIcon icon;
        MsgButtons buttons;
        Utf8 title;
        Utf8 text;
    };

    MsgAnswer show(MsgIcon icon, MsgButtons buttons, const Utf8& title, const Utf8& text) override;

    void queueAnswer(MsgAnswer answer) { answers_.push_back(answer); }
    const std::vector<Shown>& shown() const { return shown_; }
    std::vector<Shown> take();

private:
    std::vector<Shown> shown_;
    std::deque<MsgAnswer> answers_;
};

} // namespace dovrel
