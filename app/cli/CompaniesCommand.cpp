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
    std::string root = FromUtf8(Utf8(options_.mainDir));
    if (ToUtf8(root).str() != options_.mainDir)
        throw Error("The main directory cannot be named in the Hebrew code page: " +
                    options_.mainDir);
    nlohmann::json list = nlohmann::json::array();
    size_t listed = 0;
    for (const CompanyEntry& entry : FindCompanies(root)) {
        if (ListedName(entry).empty())
            continue;
        const std::string& name = entry.readingName;
        ++listed;
        if (options_.json)
            list.push_back({{"name", ToUtf8(name).str()}, {"path", ToUtf8(entry.path).str()}});
        else
            out << ToTerminal(name) << '\t' << ToTerminal(entry.path) << '\n';
    }
    if (options_.json)
        out << StateJson::Dump(list, 2) << '\n';
    if (listed > 0)
        return kExitDone;
    err << "No companies found in " << TerminalText(Path(options_.mainDir).shown()) << '\n';
    return kExitNotFound;
}

} // namespace dovrel
