#pragma once

#include "pictures/PictureDb.h"
#include "platform/SettingsStore.h"

#include <iosfwd>
#include <string>
#include <vector>

namespace dovrel {

struct PicturesOptions {
    std::string db;                // --db DIR (UTF-8); empty: the DBPath setting
    std::string app = "Dovrel";    // the settings' application name, for DBPath
    std::string action;            // init, list, add, delete, which, export or import
    std::vector<std::string> args; // the action's own arguments, UTF-8
    bool json = false;             // list as JSON
    bool force = false; // init: replace a database with ranges or a file that is not one;
                        // import: a file without ranges empties the database
};

// `dovrel pictures`: the picture ranges of "Dovrel.def" without the desktop.
// `list` prints them in the settings form's order, `add` appends one, `delete`
// removes one by its RangeID, `which` tells the picture a document line would
// get, `export` and `import` move them to and from a CSV file (an import
// replaces every range in one transaction, under the settings form's rules),
// and `init` makes an empty database. Output is UTF-8.
class PicturesCommand {
public:
    PicturesCommand(PicturesOptions options, SettingsStore& store);

    // Exit code: 0 done, 1 failed, 2 wrong arguments, 3 no such range or picture.
    int run(std::ostream& out, std::ostream& err);

private:
    // The database file, or "" after saying that no picture folder is set.
    Path dbName(std::ostream& err);
    int init(const PictureDb& db, std::ostream& out);
    int list(const PictureDb& db, std::ostream& out) const;
    int add(const PictureDb& db, std::ostream& out) const;
    int remove(const PictureDb& db, std::ostream& err) const;
    int which(const PictureDb& db, std::ostream& out, std::ostream& err) const;
    int exportTo(const PictureDb& db, std::ostream& out) const;
    int importFrom(const PictureDb& db, std::ostream& out) const;
    void needArgs(size_t count, const char* usage) const;

    PicturesOptions options_;
    SettingsStore& store_;
};

} // namespace dovrel
