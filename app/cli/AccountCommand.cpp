#include "app/cli/AccountCommand.h"

#include "app/cli/StateJson.h"
#include "fixfiles/AccountsFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"

#include <ostream>

#include <nlohmann/json.hpp>

namespace dovrel {

int AccountCommand::run(std::ostream& out) {
    std::string key = TrimCopy(FromUtf8(options_.key));
    if (key.empty())
        throw Error("Give the key of the account");
    // The scan's progress bar, which nobody sees here.
    Shape frame("ProgressFrame", 0, 0, 1000, 100);
    Shape fill("ProgressFill", 0, 0, 0, 100);
    AccountsTable table;
    ReadACT(Path(options_.compDir), table, {frame, fill});
    AccountEntry account = FindAccount(table, key);
    if (options_.json) {
        nlohmann::json answer = {{"key", ToUtf8(key)},
                                 {"found", !account.Key.empty()},
                                 {"phone", ToUtf8(account.Phone)},
                                 {"details", ToUtf8(account.Details)},
                                 {"district", ToUtf8(account.District)}};
        out << StateJson::Dump(answer, 2) << '\n';
        return 0;
    }
    out << "טלפונים: " << ToTerminal(account.Phone) << '\n'
        << "פרטים: " << ToTerminal(account.Details) << '\n'
        << "שכונה: " << ToTerminal(account.District) << '\n';
    return 0;
}

} // namespace dovrel
