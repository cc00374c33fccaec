#pragma once

// A viewer as dovrel-viewer starts it, on a private module state, with
// services a test can watch: message boxes and forms answered by the test,
// clipboard and settings in memory, the browser's address kept.

#include "app/qt/CardObject.h"
#include "app/qt/CardWidget.h"
#include "app/qt/QtBrowser.h"
#include "app/qt/QtFormPresenter.h"
#include "app/qt/QtMessages.h"
#include "app/qt/QtText.h"
#include "platform/Clock.h"
#include "platform/SettingsStore.h"

#include "TestCompany.h"

#include <QCoreApplication>
#include <QKeyEvent>
#include <QLineEdit>
#include <QMessageBox>
#include <QTest>

#include <functional>
#include <memory>
#include <vector>

namespace dovrel::test {

// One message box as the test saw it, texts in UTF-8.
struct SeenBox {
    QString title;
    QString text;
    QMessageBox::Icon icon;
    QMessageBox::StandardButtons buttons;
    Qt::LayoutDirection direction;
};

class QtHost : public ::testing::Test {
protected:
    void SetUp() override {
        messages.setRunner([this](QMessageBox& box) {
            boxes.push_back({box.windowTitle(), box.text(), box.icon(), box.standardButtons(),
                             box.layoutDirection()});
            return answer;
        });
        browser.setOpener([this](const QUrl& url) {
            opened.push_back(url);
            return true;
        });
        forms.setRunner([this](FormDialog& dialog) {
            if (workForm)
                workForm(dialog);
        });
        widget = std::make_unique<CardWidget>(services, state);
        messages.setInputHold(&widget->inputHold());
        forms.setInputHold(&widget->inputHold());
        object = std::make_unique<CardObject>(*widget);
        widget->runForUser([this] { widget->card().UserControl_InitProperties(nullptr); });
        widget->show();
        widget->activateWindow();
        EXPECT_TRUE(QTest::qWaitForWindowActive(widget.get()));
    }
    void TearDown() override {
        object.reset();
        widget.reset();
    }

    Card& card() { return widget->card(); }
    template <typename W = QWidget> W* find(const std::string& name) {
        auto* found = qobject_cast<W*>(widget->widgetFor(name));
        EXPECT_NE(found, nullptr) << name;
        return found;
    }
    void click(const std::string& name) {
        QTest::mouseClick(widget->widgetFor(name), Qt::LeftButton);
    }
    // Types the text into a widget key by key, Hebrew letters included.
    static void type(QWidget* target, const QString& text) {
        for (QChar c : text) {
            QKeyEvent press(QEvent::KeyPress, Qt::Key_unknown, Qt::NoModifier, QString(c));
            QKeyEvent release(QEvent::KeyRelease, Qt::Key_unknown, Qt::NoModifier, QString(c));
            QCoreApplication::sendEvent(target, &press);
            QCoreApplication::sendEvent(target, &release);
        }
    }
    // Replaces a text box's text as a user would: everything selected, then typed.
    static void retype(QLineEdit* box, const QString& text) {
        box->selectAll();
        QTest::keyClick(box, Qt::Key_Backspace);
        type(box, text);
    }
    void doubleClick(const std::string& name) {
        QWidget* target = widget->widgetFor(name);
        QTest::mouseDClick(target, Qt::LeftButton);
    }

    ModuleState state;
    QtMessages messages;
    MemorySettingsStore settings;
    QtFormPresenter forms{messages};
    MemoryClipboard clipboard;
    QtBrowser browser;
    FixedClock clock{CivilDate{2024, 3, 20}};
    CardServices services{messages, settings, forms, clipboard, browser, clock};
    std::unique_ptr<CardWidget> widget;
    std::unique_ptr<CardObject> object;

    QMessageBox::StandardButton answer = QMessageBox::Ok;
    std::vector<SeenBox> boxes;
    std::vector<QUrl> opened;
    std::function<void(FormDialog&)> workForm;
};

inline QString Q(const char* utf8) {
    return QString::fromUtf8(utf8);
}

} // namespace dovrel::test
