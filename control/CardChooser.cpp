#include "control/Card.h"

#include "fixfiles/AccountsFile.h"
#include "fixfiles/TextDecoding.h"
#include "forms/AccDetailsForm.h"
#include "forms/OpenDirForm.h"
#include "platform/Error.h"

namespace dovrel {

// Shows the company chooser; afterwards, confirmed or cancelled, the company
// path box takes CompDir and the position and search start over.
void Card::CmdDir_Click() {
    Form& chooser = form("frmOpenDir");
    if (auto* openDir = dynamic_cast<OpenDirForm*>(&chooser))
        openDir->prepare(*this);
    services_.forms.ShowModal(chooser);
    txtCompPath.setText(shared_.CompDir);
    txtCompPath_Change();
}

// Shows the details of the account in the account box, loading the accounts
// file when it was not loaded yet, and once more when the key is not in it.
// Every failing step is skipped.
void Card::cmdAccount_Click() {
    std::string key(Trim(txtAccountKey.Text()));
    // The accounts file is matched by the key as the control converts it,
    // also while the box shows the key in reading order.
    if (ReadingOrder() != 0 && document() && key == document()->accountKey.reading)
        key = document()->accountKey.logical;
    if (key.empty())
        return;
    AccountsTable& accounts = shared_.Accounts;
    std::string compDir = shared_.CompDir;
    if (!accounts.AccountsLoaded)
        IgnoringErrors([&] { ReadACT(compDir); });
    IgnoringErrors([&] { accounts.CurrentAccount = FindAccount(accounts, key); });
    if (accounts.CurrentAccount.Key.empty()) {
        IgnoringErrors([&] { ReadACT(compDir); });
        IgnoringErrors([&] { accounts.CurrentAccount = FindAccount(accounts, key); });
    }
    IgnoringErrors([&] {
        Form& details = form("frmAccDetails");
        if (auto* accDetails = dynamic_cast<AccDetailsForm*>(&details))
            accDetails->prepare(*this);
        services_.forms.ShowModal(details);
    });
}

} // namespace dovrel
