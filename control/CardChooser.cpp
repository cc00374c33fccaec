#include "control/Card.h"

#include "fixfiles/AccountsFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

namespace dovrel {

void Card::CmdDir_Click() {
    services_.forms.ShowModal(form("frmOpenDir"));
    txtCompPath.setText(shared_.CompDir);
    txtCompPath_Change();
}

// Shows the details of the account in the account box, loading the accounts
// file when it was not loaded yet, and once more when the key is not in it.
// Every failing step is skipped.
void Card::cmdAccount_Click() {
    std::string key(Trim(txtAccountKey.Text()));
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
    IgnoringErrors([&] { services_.forms.ShowModal(form("frmAccDetails")); });
}

} // namespace dovrel
