#include "app/qt/ViewerWindow.h"

#include "app/export/DocumentExport.h"
#include "app/qt/CardKeys.h"
#include "app/qt/QtBrowser.h"
#include "app/qt/QtText.h"
#include "pictures/ItemPicsForm.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <QAction>
#include <QCloseEvent>
#include <QCoreApplication>
#include <QDir>
#include <QFileDialog>
#include <QFileInfo>
#include <QMenuBar>
#include <QScrollArea>
#include <QStatusBar>

#include <filesystem>
#include <fstream>

namespace dovrel {

namespace {

constexpr const char* kPlaceApp = "dovrel-viewer";
constexpr const char* kPlaceSection = "Window";
constexpr const char* kPlaceKey = "Geometry";

QString Q(const char* utf8) {
    return QString::fromUtf8(utf8);
}

} // namespace

ViewerWindow::ViewerWindow(const CardServices& services, ModuleState& state, QtBrowser& browser,
                           QWidget* parent)
    : QMainWindow(parent), services_(services), browser_(browser),
      card_(new CardWidget(services, state)), keys_(new CardKeys(*card_)),
      scroll_(new QScrollArea(this)) {
    setWindowTitle(Q("דוברל"));
    setLayoutDirection(Qt::RightToLeft);
    scroll_->setWidget(card_);
    scroll_->setWidgetResizable(true);
    scroll_->setFrameShape(QFrame::NoFrame);
    setCentralWidget(scroll_);
    buildMenus();
    statusBar()->setSizeGripEnabled(true);
    connections_.push_back(card_->card().documentShown.connect([this] { documentShown(); }));
    browser.setWritten([this](const QString& file) { pageWritten(file); });
}

ViewerWindow::~ViewerWindow() {
    browser_.setWritten(nullptr);
}

QAction* ViewerWindow::addAction(QMenu* menu, const char* textUtf8, const QKeySequence& key) {
    QAction* action = menu->addAction(Q(textUtf8));
    if (!key.isEmpty())
        action->setShortcut(key);
    return action;
}

void ViewerWindow::buildMenus() {
    QMenu* file = menuBar()->addMenu(Q("&קובץ"));
    connect(addAction(file, "בחירת חברה...", QKeySequence(Qt::CTRL | Qt::Key_O)),
            &QAction::triggered, this, [this] { keys_->press("CmdDir"); });
    connect(addAction(file, "הדפסה", QKeySequence(Qt::CTRL | Qt::Key_P)), &QAction::triggered, this,
            [this] { keys_->press("PrintButt"); });
    connect(addAction(file, "ייצוא הסוג המוצג ל-CSV...", QKeySequence()), &QAction::triggered, this,
            &ViewerWindow::chooseExportFile);
    file->addSeparator();
    connect(addAction(file, "יציאה", QKeySequence(Qt::CTRL | Qt::Key_Q)), &QAction::triggered, this,
            &QWidget::close);

    QMenu* view = menuBar()->addMenu(Q("&תצוגה"));
    readingOrder_ = addAction(view, "סדר קריאה", QKeySequence());
    readingOrder_->setCheckable(true);
    connect(readingOrder_, &QAction::toggled, this, [this](bool on) {
        Card& card = card_->card();
        card_->runForUser([&card, on] { card.setReadingOrder(on ? 1 : 0); });
    });
    fullScreen_ = addAction(view, "מסך מלא", QKeySequence(Qt::Key_F11));
    fullScreen_->setCheckable(true);
    connect(fullScreen_, &QAction::toggled, this,
            [this](bool on) { on ? showFullScreen() : showNormal(); });

    QMenu* help = menuBar()->addMenu(Q("&עזרה"));
    connect(addAction(help, "אודות", QKeySequence()), &QAction::triggered, this,
            &ViewerWindow::about);
}

void ViewerWindow::start() {
    Card& card = card_->card();
    card_->runForUser([&card] {
        // The viewer reads in order unless the user saved otherwise.
        card.setReadingOrder(1);
        card.UserControl_InitProperties(nullptr);
    });
    readingOrder_->setChecked(card.ReadingOrder() != 0);
    auto found = card.shared().Forms.find("frmItemPics");
    if (found != card.shared().Forms.end())
        if (auto* pictures = dynamic_cast<ItemPicsForm*>(found->second.get()))
            connections_.push_back(pictures->databaseMissing.connect(
                [this](std::string database) { databaseMissing(database); }));
    restorePlace();
}

QString ViewerWindow::statusText() const {
    return statusBar()->currentMessage();
}

void ViewerWindow::say(const QString& text) {
    statusBar()->showMessage(text);
}

void ViewerWindow::documentShown() {
    const auto& document = card_->card().document();
    if (!document) {
        say(Q("לא נמצא מסמך"));
        return;
    }
    QString reference = ToQString(card_->card().shownText(document->reference));
    QString text = Q("מסמך %1, רשומה %2").arg(reference).arg(document->record);
    QFileInfo file(QFile::decodeName(QByteArray::fromStdString(document->file.native())));
    if (file.exists())
        text += Q(" מתוך %1").arg(file.size() / 170);
    say(text);
}

void ViewerWindow::databaseMissing(const std::string& database) {
    QString folder = QFileInfo(ToQString(database)).absolutePath();
    say(Q("קובץ ההגדרות לא נמצא בתיקייה %1").arg(folder));
}

void ViewerWindow::chooseExportFile() {
    const auto& document = card_->card().document();
    if (!document) {
        say(Q("אין מסמך מוצג, ולכן אין סוג לייצוא"));
        return;
    }
    QString suggested = QDir::home().filePath(QString("%1.csv").arg(document->type));
    QString target =
        QFileDialog::getSaveFileName(this, Q("ייצוא ל-CSV"), suggested, Q("CSV (*.csv)"));
    if (!target.isEmpty())
        exportShownType(target);
}

bool ViewerWindow::exportShownType(const QString& target) {
    const auto& document = card_->card().document();
    if (!document) {
        say(Q("אין מסמך מוצג, ולכן אין סוג לייצוא"));
        return false;
    }
    ExportOptions options;
    options.types.set(document->type);
    options.format = ExportOptions::Format::Csv;
    Path company(std::filesystem::path(document->file.native()).parent_path().string());
    // Written beside the target and moved over it only when complete, so a
    // failed export never leaves half a file where the user looks for one.
    QByteArray native = QFile::encodeName(target);
    std::string partial = native.toStdString() + ".partial";
    try {
        ExportSummary summary;
        {
            std::ofstream out(partial, std::ios::binary | std::ios::trunc);
            if (!out)
                throw std::runtime_error("Cannot write " + partial);
            summary = DocumentExport(options).run(company, out);
            out.close();
            if (!out)
                throw std::runtime_error("Cannot write " + partial);
        }
        std::filesystem::rename(partial, native.toStdString());
        QString text = Q("יוצאו %1 מסמכים אל %2").arg(summary.documents).arg(target);
        if (summary.skippedCount > 0)
            text += Q(" (%1 מסמכים פגומים דולגו)").arg(summary.skippedCount);
        say(text);
        return true;
    } catch (const std::exception& failure) {
        std::error_code ignored;
        std::filesystem::remove(partial, ignored);
        say(Q("הייצוא נכשל: %1").arg(ToQString(ErrorText(failure))));
        return false;
    }
}

void ViewerWindow::pageWritten(const QString& file) {
    say(Q("הדף נכתב אל %1").arg(file));
}

void ViewerWindow::about() {
    QString text = Q("דוברל, מציג המסמכים %1\n\n"
                     "דוברל: רישיון קנייני.\n"
                     "Qt 6: LGPL 3.\n"
                     "ICU: Unicode License.\n"
                     "SQLite: נחלת הכלל.")
                       .arg(QCoreApplication::applicationVersion());
    services_.messages.show(MsgIcon::Information, MsgButtons::Ok, Utf8("אודות"),
                            Utf8(text.toUtf8().toStdString()));
}

void ViewerWindow::restorePlace() {
    std::string stored =
        services_.settings.GetSetting(kPlaceApp, kPlaceSection, kPlaceKey, std::string());
    if (stored.empty() ||
        !restoreGeometry(QByteArray::fromBase64(QByteArray::fromStdString(stored))))
        resize(card_->sizeHint() +
               QSize(0, menuBar()->sizeHint().height() + statusBar()->sizeHint().height()));
}

void ViewerWindow::savePlace() {
    services_.settings.SaveSetting(kPlaceApp, kPlaceSection, kPlaceKey,
                                   saveGeometry().toBase64().toStdString());
}

void ViewerWindow::closeEvent(QCloseEvent* event) {
    savePlace();
    QMainWindow::closeEvent(event);
}

} // namespace dovrel
