#pragma once

#include "fixfiles/AccountsFile.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "fixfiles/DocTypes.h"
#include "pictures/PictureCache.h"
#include "platform/Form.h"
#include "platform/PathNames.h"

#include <map>
#include <memory>
#include <string>

namespace dovrel {

// The state every control of a thread shares: the company directory, the
// settings name, the picture paths, the document-type tables, the current
// document, the accounts, the company record, the side forms and the picture
// ranges last read. Each Card keeps only its own position and search. A front
// end makes one per thread or session and passes it to every control it makes;
// the controls sharing one must run on one thread.
struct ModuleState {
    std::string CompDir;
    std::string AppName = "Dovrel";
    DocTypeTable DocTypes;
    DocFileTable DocFiles;
    CurrentDocument Doc;
    AccountsTable Accounts;
    CompanyRecord Company;
    // Directories of the picture database and of the pictures, each ending
    // in a separator.
    std::string DBPath;
    std::string PicPath;
    // The printed page's logo file, company title and picture size, kept by
    // the picture settings form.
    std::string LogoFile;
    std::string CompTitle;
    std::string PicX;
    std::string PicY;
    // The native paths behind the path texts above that code page 1255
    // cannot hold.
    PathNames Paths;
    // The side forms by name, each made on first use and kept.
    std::map<std::string, std::unique_ptr<Form>> Forms;
    // The picture ranges of the last picture database read.
    PictureCache Pictures;
};

} // namespace dovrel
