#include "app/qt/QtClipboard.h"

#include "app/qt/QtText.h"
#include "platform/Error.h"

#include <QClipboard>
#include <QGuiApplication>

namespace dovrel {

namespace {

QClipboard& SystemClipboard() {
    QClipboard* clipboard = QGuiApplication::clipboard();
    if (clipboard == nullptr)
        throw Error("The clipboard cannot be reached");
    return *clipboard;
}

} // namespace

void QtClipboard::SetText(const std::string& text) {
    SystemClipboard().setText(ToQString(text));
}

std::string QtClipboard::GetText() {
    return FromQString(SystemClipboard().text());
}

} // namespace dovrel
