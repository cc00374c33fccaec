#pragma once

#include <string>
#include <vector>

namespace dovrel {

// Opens a page file for the user to read and print. The control does not
// wait for the browser and does not track its window.
class Browser {
public:
    virtual ~Browser() = default;
    // The path is code page 1255, as every path the control holds.
    virtual void Open(const std::string& path) = 0;
};

// The user's own browser, through xdg-open started directly (no shell); the
// program is not waited for.
class XdgOpenBrowser : public Browser {
public:
    void Open(const std::string& path) override;
};

// Keeps the paths it was asked to open: for tests and the automation host.
class RecordingBrowser : public Browser {
public:
    void Open(const std::string& path) override { opened.push_back(path); }
    std::vector<std::string> opened;
};

} // namespace dovrel
