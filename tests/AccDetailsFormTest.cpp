// The account details window: what the account button shows and what each
// copy button puts on the clipboard.
#include "forms/AccDetailsForm.h"

#include "TestCompany.h"
#include "control/Card.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace dovrel {
namespace {

using test::U;

// A clipboard that another program holds.
class BusyClipboard : public Clipboard {
public:
    void SetText(const std::string&) override { throw std::runtime_error("clipboard busy"); }
    std::string GetText() override { return {}; }
};

class AccDetailsFormTest : public ::testing::Test, protected test::CardDesk<AccDetailsForm> {
protected:
    // Shows the window for the account key and runs what the user does there.
    void show(const std::string& key, const std::function<void(AccDetailsForm&)>& user,
              Clipboard* board = nullptr) {
        CardServices with{messages, settings, forms, board ? *board : clipboard, browser, clock};
        Card card(with, state);
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

    test::TestCompany company{R"({"accounts": [
    {"key": "1001", "phone": "03-1234567 054-7654321", "district": "מרכז", "details": "לקוח קבוע"},
    {"key": "1002", "phone": "", "district": "צפון"}]})"};
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
        EXPECT_EQ(form.txtPhone.SelLength(), 0); // filled afresh: no selection left over
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
        ASSERT_EQ(messages.shown().size(), 1u);
        EXPECT_EQ(U(messages.shown()[0].title) + ": " + U(messages.shown()[0].text),
                  "שגיאה: לא נמצא טקסט להעתקה");
        form.txtDistrict.setText(""); // a box the user emptied
        form.cmdCopyText_Click(2);
        EXPECT_TRUE(form.Visible());
        EXPECT_THROW(form.cmdCopyText_Click(3), Error);
    });
    EXPECT_EQ(messages.shown().size(), 2u);
    EXPECT_EQ(clipboard.GetText(), "before");
}

TEST_F(AccDetailsFormTest, ABusyClipboardStillClosesTheWindow) {
    BusyClipboard busy;
    auto copy = [](AccDetailsForm& form) {
        form.Click("cmdCopyText(1)");
        EXPECT_FALSE(form.Visible());
    };
    show("1001", copy, &busy);
    EXPECT_TRUE(messages.shown().empty());
}

} // namespace
} // namespace dovrel
