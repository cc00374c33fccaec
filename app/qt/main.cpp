// dovrel-viewer [COMPDIR] [--type CODE] [--start N]: the viewer control in a
// window of its own with menus and a status bar, started as a container
// without a page starts it, with Qt's own texts in Hebrew, and
// showing the first document of the type at or after the record when a
// company is given.
#include "app/qt/CardObject.h"
#include "app/qt/CardWidget.h"
#include "app/qt/QtBrowser.h"
#include "app/qt/QtClipboard.h"
#include "app/qt/QtFormPresenter.h"
#include "app/qt/QtMessages.h"
#include "app/qt/QtText.h"
#include "app/qt/QtTranslations.h"
#include "app/qt/ViewerOptions.h"
#include "app/qt/ViewerWindow.h"
#include "platform/Clock.h"
#include "platform/Encoding.h"
#include "platform/Path.h"
#include "platform/SettingsStore.h"

#include <QApplication>
#include <QFile>

#include <iostream>
#include <string_view>

int main(int argc, char* argv[]) {
    // Without a display, so that it works in any terminal.
    for (int i = 1; i < argc; ++i) {
        if (std::string_view(argv[i]) == "--version") {
            std::cout << "dovrel-viewer " << DOVREL_VERSION << '\n';
            return 0;
        }
    }
    QApplication app(argc, argv);
    QApplication::setApplicationName("dovrel-viewer");
    QApplication::setApplicationVersion(DOVREL_VERSION);
    QApplication::setLayoutDirection(Qt::RightToLeft);
    dovrel::QtTranslations::LoadHebrew(app);
    dovrel::ViewerOptions options;
    try {
        options = dovrel::ViewerOptions::Parse(QApplication::arguments());
    } catch (const std::exception& e) {
        std::cerr << "dovrel-viewer: " << e.what() << '\n';
        return 2;
    }
    if (options.help) {
        std::cout << dovrel::ViewerOptions::HelpText().toStdString();
        return 0;
    }

    using namespace dovrel;
    QtMessages messages;
    SqliteSettingsStore settings;
    QtFormPresenter forms(messages);
    QtClipboard clipboard;
    QtBrowser browser;
    SystemClock clock;
    CardServices services{messages, settings, forms, clipboard, browser, clock};

    ModuleState state;
    ViewerWindow window(services, state, browser);
    CardWidget* card = &window.card();
    messages.setParent(&window);
    messages.setInputHold(&card->inputHold());
    forms.setParent(&window);
    forms.setInputHold(&card->inputHold());
    CardObject control(*card);
    window.start();
    window.show();
    if (!options.compDir.isEmpty()) {
        // The folder keeps its native name even where code page 1255 lacks letters of it.
        Path compDir(QFile::encodeName(options.compDir).toStdString());
        QString text = ToQString(card->card().shared().Paths.text(compDir));
        control.ShowDoc(text, static_cast<short>(options.type), options.start);
    }
    if (!control.lastError().isEmpty())
        messages.show(MsgIcon::Critical, MsgButtons::Ok, Utf8("תקלה"),
                      Utf8(control.lastError().toStdString()));
    return QApplication::exec();
}
