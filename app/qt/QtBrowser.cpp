#include "app/qt/QtBrowser.h"

#include "app/qt/QtText.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <QDesktopServices>
#include <QFile>
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

// The browser gets the path as a local file address, which escapes spaces
// and letters of any script properly.
void QtBrowser::Open(const Path& path) {
    std::string native = ResolvePath(path).native();
    QString local =
        QFile::decodeName(QByteArray(native.data(), static_cast<qsizetype>(native.size())));
    QString file = QFileInfo(local).absoluteFilePath();
    if (written_)
        written_(file);
    QUrl url = QUrl::fromLocalFile(file);
    if (!opener_(url))
        throw Error("The browser could not be started for " + FromQString(url.toString()));
}

} // namespace dovrel
