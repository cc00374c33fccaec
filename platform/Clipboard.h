#pragma once

#include <string>

namespace dovrel {

// The system clipboard: plain text in code page 1255.
class Clipboard {
public:
    virtual ~Clipboard() = default;
    virtual void SetText(const std::string& text) = 0;
    virtual std::string GetText() = 0;
};

// A clipboard that only this process sees; tests and the automation host use it.
class MemoryClipboard : public Clipboard {
public:
    void SetText(const std::string& text) override { text_ = text; }
    std::string GetText() override { return text_; }

private:
    std::string text_;
};

} // namespace dovrel
