// The account details window: what the account button shows and what each
// copy button puts on the clipboard.
#include "forms/AccDetailsForm.h"

#include "TestCompany.h"
#include "control/Card.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <gtest/gtest.h>

#include <functional>
#include <stdexcept>

namespace dovrel {
namespace {

using test::U;
using test::W;

class ScriptedForms : public FormPresenter {
public:
    void ShowModal(Form& form) override {
        form.Show();
        if (user)
            user(dynamic_cast<AccDetailsForm&>(form));
        if (form.Visible())
            form.QueryClose();
    }
    std::function<void(AccDetailsForm&)> user;
};

// A clipboard that another program holds.
class BusyClipboard : public Clipboard {
public:
    void SetText(const std::string&) override { throw std::runtime_error("clipboard busy"); }
    std::string GetText() override { return {}; }
};

const char* const kAccounts = R"({"accounts": [
    {"key": "1001", "phone": "03-1234567 054-7654321", "district": "מרכז", "details": "לקוח קבוע"},
    {"key": "1002", "phone": "", "district": "צפון"}]})";

class AccDetailsFormTest : public ::testing::Test {
protected:
    AccDetailsFormTest() : company(kAccounts) {}
    // Shows the window for the account key and runs what the user does there.
    void show(const std::string& key, const std::function<void(AccDetailsForm&)>& user,
              Clipboard* board = nullptr) {
        CardServices services{messages, settings, forms, board ? *board : clipboard,
                              browser,  clock};
        Card card(services, state);
        card.SetCompDir(Variant(company.compPath()));
        card.txtAccountKey.setText(key);
        bool shown = false;
        forms.user = [&](AccDetailsForm& form) {
            shown = true;
            user(form);
        };
        card.Click("cmdAccount");
        EXPECT_TRUE(shown);
    }
    std::string lastMessage() const {
        return messages.shown().empty() ? "" : U(messages.shown().back().text);
    }

    test::TestCompany company;
    RecordedMessages messages;
    MemorySettingsStore settings;
    ScriptedForms forms;
    MemoryClipboard clipboard;
    RecordingBrowser browser;
    FixedClock clock{{2026, 12, 6}};
    ModuleState state;
};

TEST_F(AccDetailsFormTest, ASelectionIsCopiedAndOtherwiseTheWholeBox) {
    show("1001", [](AccDetailsForm& form) {
        EXPECT_EQ(U(form.txtDetails.Text()), "לקוח קבוע");
        EXPECT_EQ(U(form.txtDistrict.Text()), "מרכז");
        form.txtPhone.setSelStart(11);
        form.txtPhone.setSelLength(11);
        form.Click("cmdCopyText(0)");
        EXPECT_FALSE(form.Visible());
    });
    EXPECT_EQ(clipboard.GetText(), "054-7654321");
    show("1001", [](AccDetailsForm& form) {
        // Filled afresh: no selection left from the last showing.
        EXPECT_EQ(form.txtPhone.SelLength(), 0);
        form.Click("cmdCopyText(2)");
    });
    EXPECT_EQ(U(clipboard.GetText()), "מרכז");
    EXPECT_TRUE(messages.shown().empty());
}

TEST_F(AccDetailsFormTest, AnEmptyBoxSaysSoAndKeepsTheWindowOpen) {
    clipboard.SetText("before");
    show("1002", [&](AccDetailsForm& form) {
        form.Click("cmdCopyText(0)");
        EXPECT_TRUE(form.Visible());
        EXPECT_EQ(lastMessage(), "לא נמצא טקסט להעתקה");
        EXPECT_EQ(U(messages.shown().back().title), "שגיאה");
        // A box the user emptied.
        form.txtDistrict.setText("");
        form.cmdCopyText_Click(2);
        EXPECT_TRUE(form.Visible());
        EXPECT_THROW(form.cmdCopyText_Click(3), Error);
    });
    EXPECT_EQ(messages.shown().size(), 2u);
    EXPECT_EQ(clipboard.GetText(), "before");
}

TEST_F(AccDetailsFormTest, AnAccountNotFoundShowsEmptyWordsThatCanBeCopied) {
    show("9999", [](AccDetailsForm& form) {
        for (const TextBox* box : {&form.txtPhone, &form.txtDetails, &form.txtDistrict})
            EXPECT_EQ(U(box->Text()), "ריק");
        form.Click("cmdCopyText(1)");
    });
    EXPECT_EQ(U(clipboard.GetText()), "ריק");
}

TEST_F(AccDetailsFormTest, ABusyClipboardStillClosesTheWindow) {
    BusyClipboard busy;
    show(
        "1001",
        [](AccDetailsForm& form) {
            form.Click("cmdCopyText(1)");
            EXPECT_FALSE(form.Visible());
        },
        &busy);
    EXPECT_TRUE(messages.shown().empty());
}

TEST(AccDetailsFormLayoutTest, EveryControlIsReachableWithItsCaption) {
    RecordedMessages messages;
    ModuleState state;
    Card card(messages, state);
    AccDetailsForm form(card);
    EXPECT_EQ(form.controls().size(), 9u);
    EXPECT_EQ(U(form.findControl("Label3")->Caption()), "שכונה:");
    EXPECT_EQ(U(form.findControl("cmdCopyText(2)")->Caption()), "העתק וסגור");
    EXPECT_THROW(form.Click("cmdCopyText(0)"), Error); // not shown
}

} // namespace
} // namespace dovrel
