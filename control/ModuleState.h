#pragma once

#include "fixfiles/AccountsFile.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "fixfiles/DocTypes.h"

#include <string>

namespace dovrel {

// The state every control of a thread shares: the company directory, the
// settings name, the document-type tables, the current document, the
// accounts and the company record. Each Card keeps only its own position and
// search. This is the one piece of module-wide state; there is one per thread.
struct ModuleState {
    std::string CompDir;
    std::string AppName = "Dovrel";
    DocTypeTable DocTypes;
    DocFileTable DocFiles;
    CurrentDocument Doc;
    AccountsTable Accounts;
    CompanyRecord Company;

    // The state of the calling thread, made on first use.
    static ModuleState& ofThisThread();
};

} // namespace dovrel
