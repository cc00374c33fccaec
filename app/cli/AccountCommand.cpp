#include "app/cli/AccountCommand.h"

#include "app/cli/CompanyDir.h"
#include "app/cli/ExitCode.h"
#include "app/session/StateJson.h"
#include "fixfiles/AccountsFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/TerminalText.h"

#include <ostream>

#include <nlohmann/json.hpp>

namespace dovrel {

int AccountCommand::run(std::ostream& out) {
    std::string key = TrimCopy(FromUtf8(Utf8(options_.key)));
    if (key.empty())
        throw Error("Give the key of the account");
    // The scan's progress bar, which nobody sees here.
    Shape frame("ProgressFrame", 0, 0, 1000, 100);
    Shape fill("ProgressFill", 0, 0, 0, 100);
    Path compDir(options_.compDir);
    CheckCompanyDir(compDir);
    AccountEntry account = FindAccountInFile(compDir, key, {frame, fill}, TextOrder::Reading);
    if (options_.json) {
        nlohmann::json answer = {{"key", ToUtf8(key).str()},
                                 {"found", !account.Key.empty()},
                                 {"phone", ToUtf8(account.Phone).str()},
                                 {"details", ToUtf8(account.Details).str()},
                                 {"district", ToUtf8(account.District).str()}};
        out << StateJson::Dump(answer, 2) << '\n';
    } else {
        out << "טלפונים: " << ToTerminal(account.Phone) << '\n'
            << "פרטים: " << ToTerminal(account.Details) << '\n'
            << "שכונה: " << ToTerminal(account.District) << '\n';
    }
    return account.Key.empty() ? kExitNotFound : kExitDone;
}

} // namespace dovrel
