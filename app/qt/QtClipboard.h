#pragma once

#include "platform/Clipboard.h"

namespace dovrel {

// The system clipboard through QClipboard: plain text only.
class QtClipboard : public Clipboard {
public:
    void SetText(const std::string& text) override;
    std::string GetText() override;
};

} // namespace dovrel
