// The picture settings form as the user drives it: its settings, its ranges
// grid and buttons over the picture database, and the control's lookup.

#include "pictures/ItemPicsForm.h"
#include "TestCompany.h"
#include "control/Card.h"
#include "pictures/PictureDb.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

namespace dovrel {
namespace {

using test::U;
using test::W;
using ::testing::_;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using Text = std::optional<std::string>;

PictureRange R(Text fromKey, Text toKey, Text fromCode, Text toCode, Text pic) {
    return {0, fromKey, toKey, fromCode, toCode, pic};
}

class ItemPicsFormTest : public ::testing::Test, protected test::CardDesk<> {
protected:
    // A control started, by default with the picture database directory set to the test's.
    ItemPicsForm& start(bool setDbDir = true) {
        if (setDbDir)
            settings.SaveSetting("Dovrel", "Params", "DBPath", dbDir);
        card = std::make_unique<Card>(services, state);
        card->UserControl_InitProperties(nullptr);
        return static_cast<ItemPicsForm&>(*state.Forms.at("frmItemPics"));
    }
    std::vector<std::vector<std::string>> rows(const ItemPicsForm& form) const {
        std::vector<std::vector<std::string>> all;
        for (int32_t row = 1; row < form.ItemPicLines.Rows(); ++row) {
            all.emplace_back();
            for (int32_t col = 0; col < 5; ++col)
                all.back().push_back(U(form.ItemPicLines.TextMatrix(row, col)));
        }
        return all;
    }

    test::TempDir dir;
    std::string dbDir = FromUtf8(Utf8(dir.str() + "/"));
    PictureDb db{dbDir + "Dovrel.def"};
    std::unique_ptr<Card> card;
};

TEST_F(ItemPicsFormTest, AFirstStartShowsTheDefaultsInTheFormAndTheModule) {
    ItemPicsForm& form = start(false);
    EXPECT_FALSE(form.Visible());
    const std::vector<std::string> defaults = {
        "c:\\logo.jpg", "רחוב הגפן 9, חיפה. טלפון: 04-8123456", "c:\\", "c:\\", "50", "50"};
    EXPECT_EQ(std::vector<std::string>({U(form.txtLogoFile.Text()), U(form.txtCompTitle.Text()),
                                        U(form.txtDBPath.Text()), U(form.txtPicPath.Text()),
                                        U(form.txtPicX.Text()), U(form.txtPicY.Text())}),
              defaults);
    EXPECT_EQ(std::vector<std::string>({U(state.LogoFile), U(state.CompTitle), state.DBPath,
                                        state.PicPath, state.PicX, state.PicY}),
              defaults);
    EXPECT_EQ(form.ItemPicLines.Rows(), 1);
    EXPECT_TRUE(messages.shown().empty());
    form.Click("Label3"); // a label does nothing
    EXPECT_THROW(form.Click("NoSuchControl"), Error);
}

TEST_F(ItemPicsFormTest, ButtonsThatNeedTheDatabaseSayWhenItIsMissing) {
    ItemPicsForm& form = start();
    for (const char* button : {"CmdNew", "CmdDelete", "CmdUpdate"}) {
        form.Click(button);
        EXPECT_EQ(shown(), std::vector<std::string>{"שגיאה: קובץ ההגדרות אינו נמצא"}) << button;
    }
    EXPECT_EQ(form.ItemPicLines.Rows(), 1);

    // The form outlives the control that made it, and a new control uses it.
    card.reset();
    Card second(services, state);
    second.UserControl_InitProperties(nullptr);
    forms.user = [](Form& shown) { shown.Click("CmdNew"); };
    second.Click("CmdParams");
    EXPECT_EQ(shown(), std::vector<std::string>{"שגיאה: קובץ ההגדרות אינו נמצא"});
}

TEST_F(ItemPicsFormTest, SavingWritesTheRowsAsRanges1ToNInOneTransaction) {
    db.create(false);
    db.replaceAll({R("1", "1", {}, "9", "a"), R("2", "2", {}, "9", "b"), R("3", "3", {}, "9", "c"),
                   R("4", "4", "1", "9", "d"), R("5", "5", {}, "9", "e")});
    ItemPicsForm& form = start();
    ASSERT_EQ(rows(form).size(), 5u);
    EXPECT_EQ(rows(form)[3], (std::vector<std::string>{"4", "4", "1", "9", "d"}));

    form.ItemPicLines.setRows(4);
    form.ItemPicLines.setTextMatrix(1, 0, "");
    form.Click("CmdUpdate");
    EXPECT_EQ(shown(), std::vector<std::string>{});
    std::vector<PictureRange> stored = db.rangesById();
    ASSERT_EQ(stored.size(), 3u);
    EXPECT_EQ(stored[0], (PictureRange{1, {}, "1", {}, "9", "a"})); // "" is stored as Null
    EXPECT_EQ(stored[2].PicFile, "c");

    // A new row starts as the widest range. (A refused row: PictureDbTest.)
    form.Click("CmdNew");
    EXPECT_EQ(rows(form)[3],
              (std::vector<std::string>{"", "תתתתתתתתתתתת", "", "999", "pic001.jpg"}));
    form.Click("CmdUpdate");
    ASSERT_EQ(db.rangesById().size(), 4u);
    EXPECT_EQ(db.rangesById()[3].ToItemKey, W("תתתתתתתתתתתת"));
    EXPECT_EQ(form.RowRangeID(4), 4);

    form.ItemPicLines.setRows(1);
    form.Click("CmdUpdate");
    EXPECT_TRUE(db.rangesById().empty());
}

TEST_F(ItemPicsFormTest, DeleteTakesTheRangeTheSelectedRowShowsEvenWithGaps) {
    db.create(false);
    db.replaceAll(
        {R("1", "1", {}, "9", "a"), R("2", "2", {}, "9", "b"), R("3", "3", {}, "9", "c")});
    db.remove(2); // another program left a gap
    ItemPicsForm& form = start();
    ASSERT_EQ(rows(form).size(), 2u);
    EXPECT_EQ(form.RowRangeID(2), 3);

    form.ItemPicLines.setRow(2);
    form.Click("CmdDelete"); // answered No
    EXPECT_EQ(shown(), std::vector<std::string>{"שימו לב: האם למחוק?"});
    EXPECT_EQ(db.rangesById().size(), 2u);

    messages.queueAnswer(MsgAnswer::Yes);
    form.Click("CmdDelete");
    ASSERT_EQ(db.rangesById().size(), 1u);
    EXPECT_EQ(db.rangesById()[0].PicFile, "a");
    EXPECT_EQ(rows(form), (std::vector<std::vector<std::string>>{{"1", "1", "", "9", "a"}}));

    // A row added but not saved deletes nothing; the grid shows the database again.
    form.Click("CmdNew");
    form.ItemPicLines.setRow(2);
    messages.queueAnswer(MsgAnswer::Yes);
    form.Click("CmdDelete");
    EXPECT_EQ(db.rangesById().size(), 1u);
    EXPECT_EQ(rows(form).size(), 1u);
}

TEST_F(ItemPicsFormTest, ReCreatingAsksAndKeepsAForeignFileUnlessConfirmedTwice) {
    db.create(false);
    db.replaceAll({R("1", "1", {}, {}, "a")});
    ItemPicsForm& form = start();
    form.Click("CmdInitDB"); // answered No
    EXPECT_EQ(shown(), std::vector<std::string>{"שימו לב: האם אתה בטוח?"});
    EXPECT_EQ(db.rangesById().size(), 1u);

    messages.queueAnswer(MsgAnswer::Yes);
    form.Click("CmdInitDB");
    EXPECT_EQ(shown(),
              (std::vector<std::string>{"שימו לב: האם אתה בטוח?", "הודעה: בסיס הנתונים אותחל"}));
    EXPECT_TRUE(db.rangesById().empty());
    EXPECT_EQ(rows(form).size(), 1u); // the grid keeps its rows for a save

    const std::string foreign = std::string("\0\1\0\0Standard Jet DB\0", 20) + "data";
    std::ofstream(dir.path() / "Dovrel.def", std::ios::binary | std::ios::trunc) << foreign;
    messages.queueAnswer(MsgAnswer::Yes);
    form.Click("CmdInitDB"); // the second question answered No
    EXPECT_THAT(shown(), ElementsAre(_, HasSubstr("אינו בסיס נתונים של תמונות (it is an Access"
                                                  " (Jet) database")));
    EXPECT_EQ(test::ReadAll(dir.path() / "Dovrel.def"), foreign);

    messages.queueAnswer(MsgAnswer::Yes);
    messages.queueAnswer(MsgAnswer::Yes);
    form.Click("CmdInitDB");
    EXPECT_EQ(shown().back(), "הודעה: בסיס הנתונים אותחל");
    EXPECT_EQ(db.inspect().kind, PictureDb::FileKind::Pictures);

    // The typed directory is taken, and a failure there says so.
    form.txtDBPath.setText(dbDir + "missing/");
    messages.queueAnswer(MsgAnswer::Yes);
    form.Click("CmdInitDB");
    EXPECT_EQ(state.DBPath, dbDir + "missing/");
    EXPECT_THAT(shown().back(), HasSubstr("תקלה: Cannot create the picture database"));
}

TEST_F(ItemPicsFormTest, SettingsAreSavedByTheirButtonAndTypingIsDroppedOnClose) {
    ItemPicsForm& form = start();
    form.txtPicX.setText("80");
    form.txtPicPath.setText("/pics/");
    form.Click("cmdSaveDef");
    EXPECT_EQ(settings.GetSetting("Dovrel", "Params", "PicX", ""), "80");
    EXPECT_EQ(settings.GetSetting("Dovrel", "Params", "LogoFile", ""), "c:\\logo.jpg");
    EXPECT_EQ(state.PicPath, "/pics/");

    forms.user = [](Form& shown) {
        auto& f = static_cast<ItemPicsForm&>(shown);
        f.txtPicX.setText("99");
        f.Click("cmdClose");
    };
    card->Click("CmdParams");
    EXPECT_FALSE(form.Visible());
    EXPECT_EQ(form.txtPicX.Text(), "80");
    EXPECT_EQ(state.PicX, "80");
}

TEST_F(ItemPicsFormTest, ADamagedDatabaseAtLoadIsReportedAndLeavesTheGridEmpty) {
    std::ofstream(dir.path() / "Dovrel.def", std::ios::binary) << std::string(5000, 'x');
    ItemPicsForm& form = start();
    EXPECT_THAT(shown(), ElementsAre(AllOf(HasSubstr("תקלה: Cannot read the picture database"),
                                           HasSubstr("not a picture database: it is not an"
                                                     " SQLite database"))));
    EXPECT_EQ(form.ItemPicLines.Rows(), 1);
}

TEST_F(ItemPicsFormTest, APrintedDemoDocumentWithDrawingsShowsTheLinePictures) {
    db.create(false);
    db.replaceAll({R({}, "ZZZ", {}, "999", "all.jpg"), R("BR", "BR-9999", {}, "999", "br.jpg")});
    ItemPicsForm& form = start();
    form.txtPicPath.setText("/pics/");
    int16_t type = 20;
    int32_t first = 2;
    ASSERT_EQ(card->ShowDoc(FromUtf8(Utf8(DOVREL_DEMO_DIR)), type, first), 0);
    card->ChkWithDrawing.setValue(1);
    for (int32_t language : {0, 1}) {
        card->CmbDocLang.setListIndex(language);
        browser.opened.clear();
        card->Click("PrintButt");
        ASSERT_EQ(browser.opened.size(), 1u) << ::testing::PrintToString(shown());
        std::string page = test::ReadAll(browser.opened[0]);
        EXPECT_THAT(page, HasSubstr("<img src='/pics/br.jpg'")) << language;
        EXPECT_THAT(page, HasSubstr("<img src='/pics/all.jpg'")) << language;
    }
}

} // namespace
} // namespace dovrel
