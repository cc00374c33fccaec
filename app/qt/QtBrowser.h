#pragma once

#include "platform/Browser.h"

#include <QUrl>

#include <functional>

namespace dovrel {

// Opens the page in the user's browser through QDesktopServices, without
// waiting for it. The opener can be replaced so tests see the address
// instead of starting a browser.
class QtBrowser : public Browser {
public:
    using Opener = std::function<bool(const QUrl& url)>;

    QtBrowser();
    void setOpener(Opener opener);

    void Open(const Path& path) override;

private:
    Opener opener_;
};

} // namespace dovrel
