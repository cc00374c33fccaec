// The company chooser as the user works it: drive and directory, scan, pick,
// cancel, close, and what the control does with the choice.
#include "forms/OpenDirForm.h"

#include "TestCompany.h"
#include "control/Card.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TempDir;
using test::U;

json Company(const std::string& name, const std::string& reference) {
    return {{"company", {{"name", name}}},
            {"documents", {test::Doc(20, reference, "c", {test::Line("A1", "a")})}}};
}

class OpenDirFormTest : public ::testing::Test, protected test::CardDesk<OpenDirForm> {
protected:
    OpenDirFormTest() {
        sample::WriteCompany(Company("גמל", "300"), main.path() / "comp01");
        sample::WriteCompany(Company("אלף", "100"), main.path() / "comp02");
        sample::WriteCompany(Company("", "900"), main.path() / "blank");
        sample::WriteCompany(Company("בית", "200"), main.path() / "comp03");
        card = std::make_unique<Card>(services, state);
        card->UserControl_InitProperties(nullptr);
    }
    std::string dir(const std::string& name) const {
        return FromUtf8(Utf8((main.path() / name).string()));
    }
    // Opens the chooser, goes to the main directory and scans it.
    void scanThen(const std::function<void(OpenDirForm&)>& then) {
        forms.user = [&](OpenDirForm& form) {
            if (form.repaint.empty())
                repainting = form.repaint.connect(
                    [&form, this] { statusWhileScanning = U(form.Msg1.Caption()); });
            form.MainDir.setPath(FromUtf8(Utf8(main.str())));
            form.Click("cmdFindWizComp");
            then(form);
        };
        card->Click("CmdDir");
    }
    OpenDirForm& chooser() { return dynamic_cast<OpenDirForm&>(*state.Forms.at("frmOpenDir")); }

    TempDir main;
    Connection repainting;
    std::string statusWhileScanning;
    std::unique_ptr<Card> card;
};

TEST_F(OpenDirFormTest, ChoosingACompanySetsThePathAndFirstReadsFromIt) {
    scanThen([&](OpenDirForm& form) {
        EXPECT_TRUE(form.cmbCompany.Enabled());
        EXPECT_EQ(U(form.Msg1.Caption()), "הסריקה הסתיימה. תקתוק כפול לבחירה...");
        form.Click("OKButton"); // nothing chosen yet: a message, and the form stays
        EXPECT_TRUE(form.Visible());
        ASSERT_EQ(messages.shown().size(), 1u);
        EXPECT_EQ(messages.shown()[0].icon, MsgIcon::Critical);
        EXPECT_EQ(shown(), std::vector<std::string>{"שגיאה: לא בחרת חברה"});
        form.cmbCompany.setListIndex(1);
        form.Click("OKButton");
        EXPECT_FALSE(form.Visible());
    });
    // Blank names are left out; the entry after one still gives its own directory.
    std::vector<std::string> listed;
    for (int32_t i = 0; i < chooser().cmbCompany.ListCount(); ++i)
        listed.push_back(U(chooser().cmbCompany.List(i)));
    EXPECT_EQ(listed, (std::vector<std::string>{"אלף", "בית", "גמל"}));
    EXPECT_EQ(statusWhileScanning, "סורק ומאתר חברות. נא להמתין..");
    EXPECT_EQ(state.CompDir, dir("comp03"));
    EXPECT_EQ(card->txtCompPath.Text(), dir("comp03"));
    EXPECT_EQ(chooser().companies().size(), 4u);
    EXPECT_EQ(chooser().LastMainDir(), FromUtf8(Utf8(main.str())));
    EXPECT_EQ(chooser().LastDrive(), "/");
    card->cmbDocType.setListIndex(13); // delivery notes
    card->Click("FirstButt");
    EXPECT_EQ(card->txtReference1.Text(), "200");
    EXPECT_TRUE(shown().empty());

    // Double-clicking an entry confirms it as OK does.
    forms.user = [](OpenDirForm& form) {
        form.cmbCompany.setListIndex(2);
        form.DblClick("cmbCompany");
    };
    card->Click("CmdDir");
    EXPECT_EQ(state.CompDir, dir("comp01"));
}

TEST_F(OpenDirFormTest, CancelKeepsThePathAndTheListButResetsThePosition) {
    scanThen([](OpenDirForm& form) {
        form.cmbCompany.setListIndex(0);
        form.Click("OKButton");
    });
    card->Click("FirstButt");
    card->DblClick("Label2");
    card->PubACTLocation = 9;
    // Cancel with another entry selected: the path stays.
    forms.user = [](OpenDirForm& form) {
        form.cmbCompany.setListIndex(1);
        form.Click("CancelButton");
    };
    card->Click("CmdDir");
    EXPECT_EQ(state.CompDir, dir("comp02"));
    EXPECT_EQ(card->PubACTLocation, 2);
    EXPECT_EQ(card->PubSearchBy, "");
    // Shown again, the form is as the user left it; the window's close button
    // unloads it, and the next showing starts afresh from the last choice.
    forms.user = [](OpenDirForm& form) {
        EXPECT_EQ(form.cmbCompany.ListCount(), 3);
        EXPECT_EQ(form.cmbCompany.ListIndex(), 1);
        form.MainDir.setPath("/");
    };
    card->Click("CmdDir");
    forms.user = [&](OpenDirForm& form) {
        EXPECT_EQ(form.cmbCompany.ListCount(), 0);
        EXPECT_EQ(form.PathDrive.Drive(), "/");
        EXPECT_EQ(form.MainDir.Path(), FromUtf8(Utf8(main.str())));
    };
    card->Click("CmdDir");
    EXPECT_EQ(state.CompDir, dir("comp02"));
    EXPECT_THROW(chooser().Click("OKButton"), Error); // a hidden form's buttons
}

TEST_F(OpenDirFormTest, AFailedScanIsReportedAndLeavesTheListEmpty) {
    std::filesystem::create_directories(main.path() / "gone");
    forms.user = [&](OpenDirForm& form) {
        form.MainDir.setPath(dir("gone"));
        EXPECT_EQ(U(form.Msg1.Caption()), "לחץ על חפש חברות חשבשבת לאיתור החברות");
        std::filesystem::remove(main.path() / "gone");
        form.Click("cmdFindWizComp");
        EXPECT_EQ(form.cmbCompany.ListCount(), 0);
        EXPECT_TRUE(form.cmbCompany.Enabled());
        EXPECT_EQ(U(form.Msg1.Caption()), "הסריקה הסתיימה. תקתוק כפול לבחירה...");
    };
    card->Click("CmdDir");
    EXPECT_THAT(shown(), ::testing::ElementsAre(::testing::AllOf(::testing::StartsWith("תקלה: "),
                                                                 ::testing::HasSubstr("gone"))));
}

TEST(OpenDirFormLoadTest, ADriveThatIsNotThereLeavesTheFirstAndADriveChangeMovesTheTree) {
    RecordedMessages messages;
    ModuleState state;
    Card card(messages, state);
    TempDir other;
    OpenDirForm form(card, {"/", FromUtf8(Utf8(other.str())), "/no-such-mount"});
    form.Load(); // the remembered drive is empty: "c:", which is not there
    EXPECT_EQ(form.PathDrive.Drive(), "/");
    EXPECT_EQ(form.MainDir.Path(), "/");
    EXPECT_EQ(form.Msg1.Caption(), "");
    form.cmbCompany.AddItem("x");
    form.PathDrive.setListIndex(1);
    EXPECT_EQ(form.MainDir.Path(), FromUtf8(Utf8(other.str())));
    EXPECT_EQ(form.cmbCompany.ListCount(), 0);
    EXPECT_EQ(U(form.Msg1.Caption()), "לחץ על חפש חברות חשבשבת לאיתור החברות");
    // A drive that cannot be opened: an error while the form is hidden, a
    // message while it is shown; the tree stays.
    EXPECT_THROW(form.PathDrive.setListIndex(2), Error);
    form.PathDrive.setListIndex(1);
    form.Show();
    form.PathDrive.setListIndex(2);
    EXPECT_EQ(form.MainDir.Path(), FromUtf8(Utf8(other.str())));
    EXPECT_EQ(messages.shown().size(), 1u);
    EXPECT_EQ(U(messages.shown().at(0).title), "תקלה");
}

} // namespace
} // namespace dovrel
