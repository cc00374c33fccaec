#include "platform/Messages.h"

#include "platform/Error.h"

#include <utility>

namespace dovrel {

MsgAnswer RecordedMessages::show(MsgIcon icon, MsgButtons buttons, const Utf8& title,
                                 const Utf8& text) {
    shown_.push_back({icon, buttons, title, text});
    if (buttons == MsgButtons::Ok)
        return MsgAnswer::Ok;
    if (answers_.empty())
        return MsgAnswer::No;
    MsgAnswer answer = answers_.front();
    answers_.pop_front();
    return answer;
}

void ShowFailure(Messages& messages, const Utf8& title, const std::exception& failure) {
    messages.show(MsgIcon::Critical, MsgButtons::Ok, title, ErrorText(failure));
}

std::vector<RecordedMessages::Shown> RecordedMessages::take() {
    return std::exchange(shown_, {});
}

} // namespace dovrel
