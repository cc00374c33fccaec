// The desktop viewer as a clerk uses it: texts in reading order, the grid
// after a search, numbers, a window that grows and shrinks, the keys, the
// status bar, Qt's texts in Hebrew and the print button with nothing shown.
// Also leaves pictures of the window at its design size and at 1600x1000.

#include "app/qt/ViewerWindow.h"
#include "app/qt/CardKeys.h"
#include "app/qt/CardObject.h"
#include "app/qt/FocusRing.h"
#include "app/qt/FormDialog.h"
#include "app/qt/QtBrowser.h"
#include "app/qt/QtFormPresenter.h"
#include "app/qt/QtMessages.h"
#include "app/qt/QtText.h"
#include "app/qt/QtTranslations.h"
#include "pictures/ItemPicsForm.h"
#include "platform/Clock.h"
#include "platform/SettingsStore.h"

#include "TestCompany.h"

#include <QAbstractButton>
#include <QAction>
#include <QApplication>
#include <QFile>
#include <QFileInfo>
#include <QHeaderView>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMessageBox>
#include <QScrollArea>
#include <QScrollBar>
#include <QTableView>
#include <QTest>
#include <QTextLayout>
#include <QToolButton>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <memory>

namespace dovrel::test {
namespace {

using nlohmann::json;

QString Q(const std::string& utf8) {
    return QString::fromStdString(utf8);
}

// Whether a text laid out in a right-to-left paragraph, as a right-to-left
// cell lays it out, shows its first character left of its last.
bool ReadsLeftToRight(const QString& text) {
    QTextLayout layout(text);
    QTextOption option;
    option.setTextDirection(Qt::RightToLeft);
    layout.setTextOption(option);
    layout.beginLayout();
    QTextLine line = layout.createLine();
    layout.endLayout();
    int first = text.startsWith(QChar(0x200E)) ? 1 : 0;
    return line.cursorToX(first) < line.cursorToX(static_cast<int>(text.size()) - 1);
}

class ViewerWindowTest : public ::testing::Test {
protected:
    void SetUp() override {
        setenv("TMPDIR", temp.str().c_str(), 1);
        messages.setRunner([this](QMessageBox& box) {
            seen.push_back(box.text());
            for (QAbstractButton* button : box.buttons())
                buttons.push_back(button->text().remove('&'));
            return QMessageBox::Ok;
        });
        browser.setOpener([this](const QUrl& url) {
            opened.push_back(url);
            return true;
        });
        forms.setRunner([](FormDialog&) {});
        open();
    }
    void TearDown() override {
        object.reset();
        window.reset();
        unsetenv("TMPDIR");
    }
    void open() {
        object.reset();
        window = std::make_unique<ViewerWindow>(services, state, browser);
        messages.setInputHold(&window->card().inputHold());
        forms.setInputHold(&window->card().inputHold());
        object = std::make_unique<CardObject>(window->card());
        window->start();
        window->show();
        window->activateWindow();
        ASSERT_TRUE(QTest::qWaitForWindowActive(window.get()));
    }
    void show(const QString& company, int type = 20) {
        object->ShowDoc(company, static_cast<short>(type), 2);
        ASSERT_TRUE(object->lastError().isEmpty()) << object->lastError().toStdString();
    }
    void showDemo() { show(QString::fromUtf8(DOVREL_DEMO_DIR)); }
    template <typename W = QWidget> W* find(const char* name) {
        auto* found = qobject_cast<W*>(window->card().widgetFor(name));
        EXPECT_NE(found, nullptr) << name;
        return found;
    }
    QString text(const char* box) { return find<QLineEdit>(box)->text(); }
    QTableView* grid() { return find<QTableView>("DocLines"); }
    QString cell(int row, int column) {
        QString shown = grid()->model()->index(row, column).data().toString();
        return shown.startsWith(QChar(0x200E)) ? shown.mid(1) : shown;
    }
    void key(int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        QTest::keyClick(QApplication::focusWidget(), static_cast<Qt::Key>(key), modifiers);
    }
    // Types the text key by key, Hebrew letters included.
    static void typeText(QWidget* target, const QString& text) {
        for (QChar c : text) {
            QKeyEvent press(QEvent::KeyPress, Qt::Key_unknown, Qt::NoModifier, QString(c));
            QKeyEvent release(QEvent::KeyRelease, Qt::Key_unknown, Qt::NoModifier, QString(c));
            QCoreApplication::sendEvent(target, &press);
            QCoreApplication::sendEvent(target, &release);
        }
    }
    void resizeTo(int width, int height) {
        window->resize(width, height);
        QCoreApplication::processEvents();
    }
    void grab(const char* name) {
        QString file = QString::fromUtf8(DOVREL_QT_OUTPUT_DIR) + "/" + name;
        EXPECT_TRUE(window->grab().save(file, "PNG")) << file.toStdString();
    }

    TempDir temp;
    ModuleState state;
    QtMessages messages;
    MemorySettingsStore settings;
    QtFormPresenter forms{messages};
    MemoryClipboard clipboard;
    QtBrowser browser;
    FixedClock clock{CivilDate{2025, 2, 1}};
    CardServices services{messages, settings, forms, clipboard, browser, clock};
    std::unique_ptr<ViewerWindow> window;
    std::unique_ptr<CardObject> object;
    std::vector<QString> seen;
    std::vector<QString> buttons;
    std::vector<QUrl> opened;
};

// Every delivery note of the demo company, stepped through with Page Down,
// reads as its description has it; with reading order off, as converted.
TEST_F(ViewerWindowTest, TextsOnScreenReadAsTheDemoCompanyWasWrittenWhileReadingOrderIsOn) {
    std::ifstream file(std::string(DOVREL_SOURCE_DIR) + "/samples/demo.json");
    json demo = json::parse(file);
    EXPECT_TRUE(window->readingOrderAction()->isChecked());
    showDemo();
    find<QLineEdit>("txtFromDate")->setFocus();
    int compared = 0;
    for (const json& doc : demo["documents"]) {
        if (doc.value("type", 0) != 20)
            continue;
        if (compared++ > 0)
            key(Qt::Key_PageDown);
        ASSERT_EQ(text("txtReference1"), Q(doc["reference"]));
        EXPECT_EQ(text("txtCustomerName"), Q(doc["customer"]));
        EXPECT_EQ(text("txtAddress1"), Q(doc["address1"]));
        EXPECT_EQ(text("txtAddress2"), Q(doc["address2"]));
        const json& lines = doc["lines"];
        ASSERT_EQ(grid()->model()->rowCount(), static_cast<int>(lines.size()) + 1);
        for (size_t i = 0; i < lines.size(); ++i) {
            int row = static_cast<int>(i);
            // A text-only line ("*") shows no item key.
            std::string itemKey = lines[i]["key"];
            EXPECT_EQ(cell(row, 1), itemKey == "*" ? QString() : Q(itemKey));
            EXPECT_EQ(cell(row, 2), Q(lines[i]["description"]));
            EXPECT_EQ(cell(row, 3), Q(lines[i].value("details", "")));
        }
    }
    EXPECT_EQ(compared, 5);
    EXPECT_EQ(text("txtReference1"), "4105");

    window->readingOrderAction()->trigger();
    EXPECT_EQ(window->card().card().ReadingOrder(), 0);
    EXPECT_EQ(text("txtAddress1"), ToQString(window->card().card().document()->address1.logical));
    EXPECT_NE(text("txtAddress1"), Q("רח' הרצל 45"));
    object->setProperty("ReadingOrder", 1);
    EXPECT_EQ(text("txtAddress1"), Q("רח' הרצל 45"));
}

// The search by details: Enter in the box searches, Page Down steps on, and
// the document found shows from its first line.
TEST_F(ViewerWindowTest, ADetailsSearchShowsEachDocumentFromItsFirstLine) {
    showDemo();
    auto* details = find<QLineEdit>("txtDetails");
    details->setFocus();
    typeText(details, Q("שחור"));
    key(Qt::Key_Return);
    EXPECT_EQ(text("txtReference1"), "4101");
    key(Qt::Key_PageDown);
    ASSERT_EQ(text("txtReference1"), "4105");
    EXPECT_EQ(cell(0, 0), "1");
    EXPECT_EQ(grid()->rowAt(0), 0);
    EXPECT_EQ(grid()->verticalScrollBar()->value(), 0);

    // Lines that do not fit can be scrolled to.
    grid()->resize(grid()->width(), grid()->horizontalHeader()->height() + 30);
    QCoreApplication::processEvents();
    EXPECT_TRUE(grid()->verticalScrollBar()->isVisible());
    EXPECT_GT(grid()->verticalScrollBar()->maximum(), 0);
}

TEST_F(ViewerWindowTest, NegativeAmountsShowTheirMinusSignBeforeTheDigits) {
    json line = Line("A1", "x", 14.94, -3);
    TestCompany company(json{{"documents", {Doc(20, "1", "y", {line})}}}.dump());
    show(ToQString(company.compPath()));
    EXPECT_EQ(cell(0, 4), "-3");
    EXPECT_EQ(cell(0, 7), "-44.82");
    for (int column : {4, 7})
        EXPECT_TRUE(ReadsLeftToRight(grid()->model()->index(0, column).data().toString()));
    EXPECT_FALSE(ReadsLeftToRight(Q("אב")));

    auto* total = find<QLineEdit>("txtTotal1");
    window->card().card().txtTotal1.setText("-24.12");
    auto caretX = [total](int position) {
        total->setCursorPosition(position);
        return total->inputMethodQuery(Qt::ImCursorRectangle).toRect().center().x();
    };
    EXPECT_LT(caretX(0), caretX(3));
}

// Larger: anchored to the right, the grid taking the room, its last columns
// in view at 1280 pixels; smaller: scroll bars. The size and place are kept.
TEST_F(ViewerWindowTest, TheWindowGrowsAndShrinksAndKeepsItsPlace) {
    showDemo();
    CardWidget& card = window->card();
    QSize design = card.sizeHint();
    QWidget* next = find("NextButt");
    auto* version = find<QLabel>("Label17");
    EXPECT_GE(version->height(), version->fontMetrics().height());
    int rightGap = card.width() - next->geometry().right();
    int gridWidth = grid()->width();
    grab("dovrel-viewer-window.png");

    resizeTo(1280, 800);
    EXPECT_EQ(card.width() - next->geometry().right(), rightGap);
    EXPECT_GT(grid()->width(), gridWidth + 400);
    EXPECT_EQ(grid()->horizontalScrollBar()->maximum(), 0);
    int columns = 0;
    for (int c = 0; c < grid()->model()->columnCount(); ++c)
        columns += grid()->columnWidth(c);
    EXPECT_LE(columns, grid()->viewport()->width());
    EXPECT_LE(version->geometry().bottom(), card.height());

    resizeTo(1600, 1000);
    grab("dovrel-viewer-1600x1000.png");

    resizeTo(design.width() / 2, design.height() / 2);
    EXPECT_EQ(card.size(), design);
    EXPECT_TRUE(window->scrollArea()->horizontalScrollBar()->isVisible());
    EXPECT_TRUE(window->scrollArea()->verticalScrollBar()->isVisible());

    resizeTo(1100, 700);
    window->close();
    open();
    EXPECT_EQ(window->size(), QSize(1100, 700));
}

TEST_F(ViewerWindowTest, TheKeysStepSearchAndPressAndTheFocusShows) {
    showDemo();
    find<QLineEdit>("txtAddress1")->setFocus();
    key(Qt::Key_End, Qt::ControlModifier);
    EXPECT_EQ(text("txtReference1"), "4105");
    key(Qt::Key_PageUp);
    EXPECT_EQ(text("txtReference1"), "4104");
    key(Qt::Key_Home, Qt::ControlModifier);
    EXPECT_EQ(text("txtReference1"), "4101");

    auto* next = find<QToolButton>("NextButt");
    next->setFocus();
    key(Qt::Key_Return);
    EXPECT_EQ(text("txtReference1"), "4102");

    // The grid is one stop; the focus ring follows; only the focused box
    // shows a selection.
    grid()->setFocus();
    key(Qt::Key_Tab);
    EXPECT_NE(QApplication::focusWidget(), grid());
    for (int i = 0; i < 12; ++i) {
        key(Qt::Key_Tab);
        QWidget* focused = QApplication::focusWidget();
        FocusRing* ring = window->keys().focusRing();
        EXPECT_EQ(ring->target(), focused);
        EXPECT_TRUE(ring->isVisible());
        for (QLineEdit* box : window->card().findChildren<QLineEdit*>()) {
            if (box != focused) {
                EXPECT_FALSE(box->hasSelectedText()) << box->objectName().toStdString();
            }
        }
    }

    auto* customer = find<QLineEdit>("txtCustomerName");
    customer->setFocus();
    customer->selectAll();
    typeText(customer, Q("לוי"));
    key(Qt::Key_Enter);
    EXPECT_EQ(text("txtReference1"), "4102");
    EXPECT_EQ(window->card().card().PubSearchBy, "CustomerName");
}

// The status bar says what each step did; the print button with nothing
// shown says so and writes nothing.
TEST_F(ViewerWindowTest, TheStatusBarSaysWhatHappened) {
    showDemo();
    EXPECT_TRUE(window->statusText().contains("4101")) << window->statusText().toStdString();
    key(Qt::Key_P, Qt::ControlModifier);
    ASSERT_EQ(opened.size(), 1u);
    EXPECT_TRUE(window->statusText().contains(opened[0].toLocalFile()))
        << window->statusText().toStdString();

    auto* customer = find<QLineEdit>("txtCustomerName");
    customer->setFocus();
    customer->selectAll();
    typeText(customer, Q("אין לקוח כזה"));
    key(Qt::Key_Return);
    EXPECT_EQ(window->statusText(), Q("לא נמצא מסמך"));
    EXPECT_EQ(text("txtReference1"), "");
    key(Qt::Key_P, Qt::ControlModifier);
    EXPECT_EQ(opened.size(), 1u);
    ASSERT_EQ(seen.size(), 1u);
    EXPECT_EQ(seen[0], Q("אין מסמך להדפסה"));

    auto& pictures = dynamic_cast<ItemPicsForm&>(*state.Forms.at("frmItemPics"));
    state.DBPath = FromUtf8(Utf8(temp.str() + "/missing/"));
    EXPECT_FALSE(pictures.CheckDBFile());
    EXPECT_TRUE(window->statusText().contains(Q(temp.str() + "/missing")))
        << window->statusText().toStdString();
}

TEST_F(ViewerWindowTest, ExportsTheShownTypeAsCsv) {
    QString target = QString::fromStdString(temp.str() + "/20.csv");
    EXPECT_FALSE(window->exportShownType(target));
    EXPECT_FALSE(QFileInfo::exists(target));
    showDemo();
    ASSERT_TRUE(window->exportShownType(target)) << window->statusText().toStdString();
    QFile file(target);
    ASSERT_TRUE(file.open(QIODevice::ReadOnly));
    QByteArray csv = file.readAll();
    EXPECT_TRUE(csv.startsWith("\xEF\xBB\xBF"));
    // The demo's delivery notes, counted in the status bar.
    for (const char* reference : {"4101", "4105"})
        EXPECT_TRUE(csv.contains(reference)) << reference;
    EXPECT_TRUE(window->statusText().contains(Q("יוצאו 5 מסמכים")))
        << window->statusText().toStdString();
    EXPECT_FALSE(QFileInfo::exists(target + ".partial"));
}

TEST_F(ViewerWindowTest, MessageBoxesSpeakHebrew) {
    ASSERT_TRUE(QtTranslations::LoadHebrew(*QCoreApplication::instance()));
    messages.show(MsgIcon::Question, MsgButtons::YesNo, Utf8("t"), Utf8("q"));
    messages.show(MsgIcon::Information, MsgButtons::Ok, Utf8("t"), Utf8("i"));
    std::sort(buttons.begin(), buttons.end());
    std::vector<QString> hebrew = {Q("כן"), Q("לא"), Q("אישור")};
    std::sort(hebrew.begin(), hebrew.end());
    EXPECT_EQ(buttons, hebrew);
}

} // namespace
} // namespace dovrel::test
