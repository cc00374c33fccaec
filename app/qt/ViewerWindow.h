#pragma once

#include "app/qt/CardWidget.h"
#include "platform/Connection.h"

#include <QMainWindow>

#include <vector>

class QAction;
class QScrollArea;

namespace dovrel {

class CardKeys;
class QtBrowser;

// The desktop application around one CardWidget: a menu bar (file: choose
// company, print, quit; view: reading order, full screen; help: about), a
// status bar that says what the last step did (the document shown and its
// place in its file, nothing found, where the page went, where a picture
// database was looked for), the keys of CardKeys, scroll bars below the
// design size, and the window's size and place kept in the settings store.
// The control itself is unchanged.
class ViewerWindow : public QMainWindow {
    Q_OBJECT

public:
    ViewerWindow(const CardServices& services, ModuleState& state, QtBrowser& browser,
                 QWidget* parent = nullptr);
    ~ViewerWindow() override;

    // Starts the control as a container without a page does, with reading
    // order on unless the user's settings say otherwise, and puts the window
    // where it was last closed.
    void start();
    // Writes every document of the shown document's type, of the shown
    // company, as CSV to target; the status bar says how it went.
    bool exportShownType(const QString& target);

    CardWidget& card() { return *card_; }
    CardKeys& keys() { return *keys_; }
    QScrollArea* scrollArea() const { return scroll_; }
    QAction* readingOrderAction() const { return readingOrder_; }
    QString statusText() const;

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void buildMenus();
    QAction* addAction(QMenu* menu, const char* textUtf8, const QKeySequence& key);
    void documentShown();
    void databaseMissing(const std::string& database);
    void pageWritten(const QString& file);
    void about();
    void chooseExportFile();
    void say(const QString& text);
    void restorePlace();
    void savePlace();

    const CardServices& services_;
    QtBrowser& browser_;
    CardWidget* card_;
    CardKeys* keys_;
    QScrollArea* scroll_;
    QAction* readingOrder_ = nullptr;
    QAction* fullScreen_ = nullptr;
    std::vector<Connection> connections_;
};

} // namespace dovrel
