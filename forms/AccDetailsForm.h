#pragma once

#include "platform/Controls.h"
#include "platform/Form.h"

#include <array>
#include <cstdint>
#include <string>

namespace dovrel {

class FormHost;
struct AccountEntry;

// The account details window: the phones, details and district of the
// account on screen, each with a button that copies it and closes the
// window. The buttons form the control array cmdCopyText, whose elements are
// named "cmdCopyText(0)" to "cmdCopyText(2)".
class AccDetailsForm : public Form {
public:
    explicit AccDetailsForm(FormHost& host);

    // The control that shows the window now: its clipboard and messages are
    // used, and the boxes are filled afresh from the current account.
    void prepare(FormHost& host);

    // Fills the boxes from the current account.
    void Load() override;
    void Click(const std::string& name) override;

    // Copies the selected text of box Index (0 phones, 1 details, 2 district),
    // or its whole text when nothing is selected, and closes the window. Only
    // while the window is shown.
    void cmdCopyText_Click(int16_t Index);

    Label Label1{"Label1"};
    TextBox txtPhone{"txtPhone"};
    Label Label2{"Label2"};
    TextBox txtDetails{"txtDetails"};
    Label Label3{"Label3"};
    TextBox txtDistrict{"txtDistrict"};
    std::array<Button, 3> cmdCopyText;

private:
    const AccountEntry& account_;
    FormHost* host_;
};

} // namespace dovrel
