#include "app/cli/CompaniesCommand.h"

#include "app/cli/ExitCode.h"
#include "app/session/StateJson.h"
#include "forms/Companies.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/Path.h"
#include "platform/TerminalText.h"

#include <ostream>

#include <nlohmann/json.hpp>

namespace dovrel {

int CompaniesCommand::run(std::ostream& out, std::ostream& err) {
    if (options_.mainDir.empty())
        throw Error("Give the main directory to scan");
    Path root(options_.mainDir);
    nlohmann::json list = nlohmann::json::array();
    size_t listed = 0;
    for (const CompanyEntry& entry : FindCompanies(root)) {
        if (ListedName(entry).empty())
            continue;
        const std::string& name = entry.readingName;
        ++listed;
        if (options_.json)
            list.push_back({{"name", ToUtf8(name).str()}, {"path", entry.folder.shown().str()}});
        else
            out << ToTerminal(name) << '\t' << TerminalText(entry.folder.shown()) << '\n';
    }
    if (options_.json)
        out << StateJson::Dump(list, 2) << '\n';
    if (listed > 0)
        return kExitDone;
    err << "No companies found in " << TerminalText(root.shown()) << '\n';
    return kExitNotFound;
}

} // namespace dovrel
