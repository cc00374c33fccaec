#include "QtHost.h"

#include "forms/AccDetailsForm.h"
#include "forms/OpenDirForm.h"

#include <QComboBox>
#include <QFileSystemModel>
#include <QLabel>
#include <QListWidget>
#include <QTableView>
#include <QTreeView>

namespace dovrel::test {
namespace {

using json = nlohmann::json;

// The three side forms as dialogs, worked by the test while they are shown.
class FormDialogTest : public QtHost {
protected:
    template <typename W = QWidget> static W* in(FormDialog& dialog, const std::string& name) {
        auto* found = qobject_cast<W*>(dialog.widgetFor(name));
        EXPECT_NE(found, nullptr) << name;
        return found;
    }
    static void press(FormDialog& dialog, const std::string& name) {
        QTest::mouseClick(dialog.widgetFor(name), Qt::LeftButton);
    }
    // Shows the dialog the control opens on a click and lets the test work it.
    void open(const std::string& button, std::function<void(FormDialog&)> work) {
        bool shown = false;
        workForm = [&](FormDialog& dialog) {
            shown = true;
            dialog.show();
            dialog.activateWindow();
            EXPECT_TRUE(QTest::qWaitForWindowActive(&dialog));
            EXPECT_EQ(dialog.layoutDirection(), Qt::RightToLeft);
            work(dialog);
            // A picture of the dialog as the test left it, for a look at its layout.
            dialog.grab().save(QString::fromUtf8(DOVREL_QT_OUTPUT_DIR) + "/" +
                               QString::fromStdString(dialog.form().name()) + ".png");
        };
        click(button);
        EXPECT_TRUE(shown) << button;
        workForm = nullptr;
    }
};

TEST_F(FormDialogTest, AccountDetailsCopyTheSelectionOrTheWholeBox) {
    json account = {{"key", "1001"},
                    {"phone", "03-1234567 054-7654321"},
                    {"district", "מרכז"},
                    {"details", "לקוח ותיק"}};
    TestCompany company(json{{"accounts", {account}}}.dump());
    card().txtCompPath.setText(company.compPath());
    retype(find<QLineEdit>("txtAccountKey"), "1001");
    open("cmdAccount", [&](FormDialog& dialog) {
        EXPECT_EQ(dialog.windowTitle(), Q("פרטי כרטיס"));
        EXPECT_EQ(in<QLineEdit>(dialog, "txtDistrict")->text().trimmed(), Q("מרכז"));
        auto* phone = in<QLineEdit>(dialog, "txtPhone");
        ASSERT_TRUE(phone->text().startsWith("03-1234567"));
        phone->setFocus();
        phone->setSelection(0, 10);
        press(dialog, "cmdCopyText(0)");
        EXPECT_FALSE(dialog.form().Visible());
    });
    EXPECT_EQ(clipboard.GetText(), "03-1234567");

    // A box the user emptied reaches the form: nothing to copy, the window stays.
    open("cmdAccount", [&](FormDialog& dialog) {
        retype(in<QLineEdit>(dialog, "txtDetails"), "");
        press(dialog, "cmdCopyText(1)");
        EXPECT_TRUE(dialog.form().Visible());
        press(dialog, "cmdCopyText(2)");
    });
    EXPECT_EQ(U(clipboard.GetText()), "מרכז");
    EXPECT_EQ(boxes.size(), 1u);
}

TEST_F(FormDialogTest, AClosedDialogLeavesNoListenerOnTheForm) {
    TestCompany company(json{{"accounts", {{{"key", "1001"}, {"phone", "03"}}}}}.dump());
    card().txtCompPath.setText(company.compPath());
    retype(find<QLineEdit>("txtAccountKey"), "1001");
    auto listeners = [this] {
        auto& form = dynamic_cast<AccDetailsForm&>(*state.Forms.at("frmAccDetails"));
        return form.txtPhone.changed.slotCount() + form.Label1.captionChanged.slotCount();
    };
    size_t whileShown = 0;
    open("cmdAccount", [&](FormDialog&) { whileShown = listeners(); });
    size_t afterFirst = listeners();
    EXPECT_GT(whileShown, afterFirst);
    open("cmdAccount", [&](FormDialog&) { EXPECT_EQ(listeners(), whileShown); });
    EXPECT_EQ(listeners(), afterFirst);
}

TEST_F(FormDialogTest, TheCompanyChooserScansTheChosenDirectoryAndReturnsTheCompany) {
    TempDir main;
    for (auto [dir, name] : {std::pair{"comp01", "גמל"}, {"comp02", "אלף"}})
        sample::WriteCompany(json{{"company", {{"name", name}}}, {"documents", json::array()}},
                             main.path() / dir);
    open("CmdDir", [&](FormDialog& dialog) {
        EXPECT_EQ(in<QComboBox>(dialog, "PathDrive")->itemText(0), "/");
        auto* tree = in<QTreeView>(dialog, "MainDir");
        auto* files = qobject_cast<QFileSystemModel*>(tree->model());
        tree->setCurrentIndex(files->index(QString::fromStdString(main.str())));
        EXPECT_EQ(static_cast<OpenDirForm&>(dialog.form()).MainDir.Path(), W(main.str()));
        press(dialog, "cmdFindWizComp");
        auto* list = in<QListWidget>(dialog, "cmbCompany");
        ASSERT_EQ(list->count(), 2);
        EXPECT_EQ(list->item(0)->text() + "," + list->item(1)->text(), Q("אלף,גמל"));
        EXPECT_EQ(in<QLabel>(dialog, "Msg1")->text(), Q("הסריקה הסתיימה. תקתוק כפול לבחירה..."));
        list->setCurrentRow(1);
        press(dialog, "OKButton");
        EXPECT_FALSE(dialog.form().Visible());
    });
    EXPECT_EQ(find<QLineEdit>("txtCompPath")->text(),
              QString::fromStdString((main.path() / "comp01").string()));
    EXPECT_EQ(card().PubACTLocation, 2);
}

TEST_F(FormDialogTest, TheChooserShowsThatItScansBeforeTheScanEnds) {
    TempDir main;
    std::filesystem::create_directories(main.path() / "gone");
    QString shownDuringScan;
    open("CmdDir", [&](FormDialog& dialog) {
        auto* tree = in<QTreeView>(dialog, "MainDir");
        auto* files = qobject_cast<QFileSystemModel*>(tree->model());
        tree->setCurrentIndex(
            files->index(QString::fromStdString((main.path() / "gone").string())));
        std::filesystem::remove(main.path() / "gone");
        // The failed scan's message box opens while the handler still runs.
        messages.setRunner([&](QMessageBox& box) {
            shownDuringScan = in<QLabel>(dialog, "Msg1")->text();
            boxes.push_back({box.windowTitle(), box.text(), box.icon(), box.standardButtons(),
                             box.layoutDirection()});
            return QMessageBox::Ok;
        });
        press(dialog, "cmdFindWizComp");
        EXPECT_EQ(in<QLabel>(dialog, "Msg1")->text(), Q("הסריקה הסתיימה. תקתוק כפול לבחירה..."));
        press(dialog, "CancelButton");
    });
    EXPECT_EQ(shownDuringScan, Q("סורק ומאתר חברות. נא להמתין.."));
    ASSERT_EQ(boxes.size(), 1u);
    EXPECT_EQ(boxes[0].title, Q("תקלה"));
}

TEST_F(FormDialogTest, ThePictureSettingsFormEditsItsRangesInTheGrid) {
    TempDir db;
    open("CmdParams", [&](FormDialog& dialog) {
        EXPECT_EQ(in<QLineEdit>(dialog, "txtCompTitle")->text(),
                  Q("רחוב הגפן 9, חיפה. טלפון: 04-8123456"));
        auto* grid = in<QTableView>(dialog, "ItemPicLines");
        EXPECT_EQ(grid->model()->headerData(0, Qt::Horizontal).toString().trimmed(),
                  Q("ממפתח פריט"));
        retype(in<QLineEdit>(dialog, "txtDBPath"), QString::fromStdString(db.str() + "/"));
        answer = QMessageBox::Yes;
        press(dialog, "CmdInitDB");
        ASSERT_EQ(boxes.size(), 2u);
        EXPECT_EQ(boxes[0].buttons, QMessageBox::Yes | QMessageBox::No);
        EXPECT_EQ(boxes[1].title + "|" + boxes[1].text, Q("הודעה|בסיס הנתונים אותחל"));
        EXPECT_EQ(boxes[1].icon, QMessageBox::Information);

        press(dialog, "CmdNew");
        ASSERT_EQ(grid->model()->rowCount(), 1);
        EXPECT_EQ(grid->model()->index(0, 4).data().toString(), "pic001.jpg");
        // The user types a cell in place; the form's grid has it.
        grid->model()->setData(grid->model()->index(0, 4), "drill.jpg");
        EXPECT_EQ(static_cast<Grid&>(*dialog.form().findControl("ItemPicLines")).TextMatrix(1, 4),
                  "drill.jpg");
        press(dialog, "CmdUpdate");
        EXPECT_EQ(boxes.size(), 2u);
        press(dialog, "cmdClose");
        EXPECT_FALSE(dialog.form().Visible());
    });
    EXPECT_TRUE(std::filesystem::exists(db.path() / "Dovrel.def"));
}

} // namespace
} // namespace dovrel::test
