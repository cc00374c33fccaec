#include "platform/Messages.h"

#include "platform/Encoding.h"

#include <utility>

namespace dovrel {

MsgAnswer RecordedMessages::show(MsgIcon icon, MsgButtons buttons, const std::string& title,
                                 const std::string& text) {
    shown_.push_back({icon, buttons, title, text});
    if (buttons == MsgButtons::Ok)
        return MsgAnswer::Ok;
    if (answers_.empty())
        return MsgAnswer::No;
    MsgAnswer answer = answers_.front();
    answers_.pop_front();
    return answer;
}

void ShowFailure(Messages& messages, const std::string& titleUtf8, const std::exception& failure) {
    messages.show(MsgIcon::Critical, MsgButtons::Ok, FromUtf8(titleUtf8), FromUtf8(failure.what()));
}

std::vector<RecordedMessages::Shown> RecordedMessages::take() {
    return std::exchange(shown_, {});
}

} // namespace dovrel
