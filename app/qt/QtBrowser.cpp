#include "app/qt/QtBrowser.h"

#include "app/qt/QtText.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <QDesktopServices>
#include <QFileInfo>

namespace dovrel {

namespace {

bool OpenWithDesktop(const QUrl& url) {
    return QDesktopServices::openUrl(url);
}

} // namespace

QtBrowser::QtBrowser() : opener_(OpenWithDesktop) {}

void QtBrowser::setOpener(Opener opener) {
    opener_ = opener ? std::move(opener) : Opener(OpenWithDesktop);
}

// The path is the core's file name; the browser gets it as a local file
// address, which escapes spaces and Hebrew letters properly.
void QtBrowser::Open(const std::string& path) {
    QString local = QString::fromStdString(ResolvePath(path));
    QUrl url = QUrl::fromLocalFile(QFileInfo(local).absoluteFilePath());
    if (!opener_(url))
        throw Error("The browser could not be started for " + FromQString(url.toString()));
}

} // namespace dovrel
