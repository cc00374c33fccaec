#pragma once

#include "platform/Path.h"

#include <string>
#include <vector>

namespace dovrel {

// Opens a page file for the user to read and print. The control does not
// wait for the browser and does not track its window.
class Browser {
public:
    virtual ~Browser() = default;
    virtual void Open(const Path& path) = 0;
};

// The user's own browser, through xdg-open started directly (no shell); the
// program is not waited for.
class XdgOpenBrowser : public Browser {
public:
    void Open(const Path& path) override;
};

// Keeps the paths it was asked to open: for tests and the automation host.
class RecordingBrowser : public Browser {
public:
    void Open(const Path& path) override { opened.push_back(path.native()); }
    // The native bytes of each path.
    std::vector<std::string> opened;
};

} // namespace dovrel
