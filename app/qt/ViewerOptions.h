#pragma once

#include <QString>
#include <QStringList>

namespace dovrel {

// The command line of dovrel-viewer: [COMPDIR] [--type CODE] [--start N].
struct ViewerOptions {
    QString compDir; // empty: no document is shown at start
    int type = 20;
    int start = 2;
    bool help = false;

    // Reads the arguments, the program's name first. Anything wrong (an
    // unknown option, a second directory, a type outside 16 bits, a start
    // below 1) is an Error that says what.
    static ViewerOptions Parse(const QStringList& arguments);
    static QString HelpText();
};

} // namespace dovrel
