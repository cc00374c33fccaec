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

    // Told the full name of each page it is asked to open, before the
    // browser is started.
    using Written = std::function<void(const QString& file)>;

    QtBrowser();
    void setOpener(Opener opener);
    void setWritten(Written written) { written_ = std::move(written); }

    void Open(const Path& path) override;

private:
    Opener opener_;
    Written written_;
};

} // namespace dovrel
