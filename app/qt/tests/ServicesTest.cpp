#include "app/qt/QtBrowser.h"
#include "app/qt/QtClipboard.h"
#include "app/qt/QtText.h"
#include "platform/Encoding.h"
#include "platform/Error.h"

#include "TestCompany.h"

#include <QDate>
#include <QUrl>

#include <fstream>

namespace dovrel {
namespace {

using test::TempDir;
using test::W;

TEST(ServicesTest, TheClipboardKeepsHebrewTextAndTheBrowserGetsTheLocalFileOfThePage) {
    QtClipboard clipboard;
    clipboard.SetText(W("טלפון 03-1234567"));
    EXPECT_EQ(clipboard.GetText(), W("טלפון 03-1234567"));

    TempDir dir;
    std::filesystem::path page = dir.path() / "דף הדפסה.htm";
    std::ofstream(page) << "<html></html>";
    QtBrowser browser;
    std::vector<QUrl> opened;
    browser.setOpener([&](const QUrl& url) { return opened.push_back(url), true; });
    browser.Open(Path(page.string()));
    ASSERT_EQ(opened.size(), 1u);
    EXPECT_EQ(opened[0].toLocalFile(), QString::fromStdString(page.string()));
    browser.setOpener([](const QUrl&) { return false; });
    EXPECT_THROW(browser.Open(Path(page.string())), Error);
}

TEST(ServicesTest, HostValuesBecomeTheControlsVariantsAndBack) {
    EXPECT_TRUE(FromQVariant(QVariant()).isEmpty());
    EXPECT_TRUE(FromQVariant(QVariant::fromValue(nullptr)).isNull());
    EXPECT_EQ(FromQVariant(QString::fromUtf8("אבג")), Variant(W("אבג")));
    EXPECT_EQ(FromQVariant(10.5), Variant(10.5));
    EXPECT_EQ(FromQVariant(QVariant::fromValue<short>(-3)), Variant(-3));
    EXPECT_EQ(FromQVariant(true), Variant(true));
    EXPECT_THROW(FromQVariant(QDate(2024, 1, 1)), Error);

    EXPECT_FALSE(ToQVariant(Variant()).isValid());
    EXPECT_EQ(ToQVariant(Variant::Null()).typeId(), QMetaType::Nullptr);
    EXPECT_EQ(ToQVariant(Variant(W("שלום"))), QVariant(QString::fromUtf8("שלום")));
    EXPECT_EQ(ToQVariant(Variant(12)), QVariant(12.0));
    EXPECT_EQ(ToQVariant(Variant(false)), QVariant(false));
    // Every byte is its own character and comes back: one the code page
    // leaves undefined too, and a control byte.
    std::string odd("\xFF\x01", 2);
    EXPECT_EQ(ToQString(odd), QString::fromUtf8("\u00FF\u0001"));
    EXPECT_EQ(FromQString(ToQString(odd)), odd);
}

} // namespace
} // namespace dovrel
