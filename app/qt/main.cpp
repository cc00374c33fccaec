// dovrel-viewer [COMPDIR] [--type CODE] [--start N]: the viewer control in a
// window of its own, started as a container without a page starts it, and
// showing the first document of the type at or after the record when a
// company is given.
#include "app/qt/CardObject.h"
#include "app/qt/CardWidget.h"
#include "app/qt/QtBrowser.h"
#include "app/qt/QtClipboard.h"
#include "app/qt/QtFormPresenter.h"
#include "app/qt/QtMessages.h"
#include "app/qt/QtText.h"
#include "platform/Clock.h"
#include "platform/Encoding.h"
#include "platform/SettingsStore.h"

#include <QApplication>
#include <QCommandLineParser>
#include <QMainWindow>

#include <iostream>

namespace {

struct Options {
    QString compDir;
    int type = 20;
    int start = 2;
};

bool ParseNumber(const QString& text, int low, int high, int& value) {
    bool ok = false;
    int number = text.toInt(&ok);
    if (!ok || number < low || number > high)
        return false;
    value = number;
    return true;
}

// Reads the command line; false after printing what is wrong with it.
bool ParseOptions(const QApplication& app, Options& options) {
    QCommandLineParser parser;
    parser.setApplicationDescription("Shows the stock documents of a company.");
    parser.addHelpOption();
    parser.addPositionalArgument("COMPDIR", "The company directory to open.", "[COMPDIR]");
    QCommandLineOption type("type", "The document type code (default 20).", "CODE", "20");
    QCommandLineOption start("start", "The record to start from, 1 or more (default 2).", "N", "2");
    parser.addOption(type);
    parser.addOption(start);
    parser.process(app);
    if (parser.positionalArguments().size() > 1) {
        std::cerr << "dovrel-viewer: give at most one company directory\n";
        return false;
    }
    if (!ParseNumber(parser.value(type), -32768, 32767, options.type)) {
        std::cerr << "dovrel-viewer: --type takes a document type code\n";
        return false;
    }
    if (!ParseNumber(parser.value(start), 1, 2147483647, options.start)) {
        std::cerr << "dovrel-viewer: --start takes a record number of 1 or more\n";
        return false;
    }
    if (!parser.positionalArguments().isEmpty())
        options.compDir = parser.positionalArguments().front();
    return true;
}

} // namespace

int main(int argc, char* argv[]) {
    QApplication app(argc, argv);
    QApplication::setApplicationName("dovrel-viewer");
    QApplication::setLayoutDirection(Qt::RightToLeft);
    Options options;
    if (!ParseOptions(app, options))
        return 2;

    using namespace dovrel;
    QtMessages messages;
    SqliteSettingsStore settings;
    QtFormPresenter forms(messages);
    QtClipboard clipboard;
    QtBrowser browser;
    SystemClock clock;
    CardServices services{messages, settings, forms, clipboard, browser, clock};

    QMainWindow window;
    auto* card = new CardWidget(services);
    window.setCentralWidget(card);
    window.setWindowTitle(ToQString(FromUtf8("דוברל")));
    messages.setParent(&window);
    messages.setInputHold(&card->inputHold());
    forms.setParent(&window);
    forms.setInputHold(&card->inputHold());
    CardObject control(*card);
    card->runForUser([&] { card->card().UserControl_InitProperties(nullptr); });
    window.show();
    if (!options.compDir.isEmpty())
        control.ShowDoc(options.compDir, static_cast<short>(options.type), options.start);
    if (!control.lastError().isEmpty())
        messages.show(MsgIcon::Critical, MsgButtons::Ok, FromUtf8("תקלה"),
                      FromQString(control.lastError()));
    return QApplication::exec();
}
