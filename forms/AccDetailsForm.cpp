#include "forms/AccDetailsForm.h"

#include "fixfiles/AccountsFile.h"
#include "forms/FormDesigns.h"
#include "forms/FormHost.h"
#include "platform/Clipboard.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/Messages.h"

namespace dovrel {

AccDetailsForm::AccDetailsForm(FormHost& host)
    : Form("frmAccDetails"), cmdCopyText{Button(ArrayElementName("cmdCopyText", 0)),
                                         Button(ArrayElementName("cmdCopyText", 1)),
                                         Button(ArrayElementName("cmdCopyText", 2))},
      account_(host.currentAccount()), host_(&host) {
    for (Control* control :
         std::initializer_list<Control*>{&Label1, &txtPhone, &cmdCopyText[0], &Label2, &txtDetails,
                                         &cmdCopyText[1], &Label3, &txtDistrict, &cmdCopyText[2]}) {
        addControl(*control);
        for (const ControlDesign& design : AccDetailsDesign())
            if (design.name == control->name())
                control->setCaption(design.caption);
    }
}

void AccDetailsForm::prepare(FormHost& host) {
    host_ = &host;
    Load();
}

// A window loaded afresh: the account's texts, nothing selected.
void AccDetailsForm::Load() {
    const AccountEntry& account = account_;
    txtPhone.setText(account.Phone);
    txtDetails.setText(account.Details);
    txtDistrict.setText(account.District);
    for (TextBox* box : {&txtPhone, &txtDetails, &txtDistrict}) {
        box->setSelLength(0);
        box->setSelStart(0);
    }
}

void AccDetailsForm::Click(const std::string& name) {
    for (size_t i = 0; i < cmdCopyText.size(); ++i)
        if (name == cmdCopyText[i].name()) {
            if (!Visible())
                throw Error("The account details window is not shown; " + name + " cannot be used");
            return cmdCopyText_Click(static_cast<int16_t>(i));
        }
}

void AccDetailsForm::cmdCopyText_Click(int16_t Index) {
    if (!Visible())
        throw Error("The account details window is not shown; cmdCopyText cannot be used");
    TextBox* boxes[] = {&txtPhone, &txtDetails, &txtDistrict};
    if (Index < 0 || Index > 2)
        throw Error("cmdCopyText has no element " + std::to_string(Index));
    const TextBox& box = *boxes[Index];
    std::string text = box.SelText();
    if (text.empty())
        text = box.Text();
    if (text.empty()) {
        host_->formMessages().show(MsgIcon::Critical, MsgButtons::Ok, Utf8("שגיאה"),
                                   Utf8("לא נמצא טקסט להעתקה"));
        return;
    }
    // A clipboard that another program holds must not keep the window open.
    IgnoringErrors([&] { host_->formClipboard().SetText(text); });
    Hide();
}

} // namespace dovrel
