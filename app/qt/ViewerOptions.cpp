#include "app/qt/ViewerOptions.h"

#include "app/qt/QtText.h"
#include "platform/Error.h"

#include <QCommandLineParser>

#include <limits>

namespace dovrel {

namespace {

const QCommandLineOption kType("type", "The document type code (default 20).", "CODE", "20");
// Answered in main before the window system is reached; listed here for --help.
const QCommandLineOption kVersion("version", "Prints the version and stops.");
const QCommandLineOption kStart("start", "The record to start from, 1 or more (default 2).", "N",
                                "2");

void Describe(QCommandLineParser& parser) {
    parser.setApplicationDescription("Shows the stock documents of a company.");
    parser.addHelpOption();
    parser.addPositionalArgument("COMPDIR", "The company directory to open.", "[COMPDIR]");
    parser.addOption(kType);
    parser.addOption(kStart);
    parser.addOption(kVersion);
}

int Number(const QString& text, long long low, long long high, const char* what) {
    bool ok = false;
    long long number = text.trimmed().toLongLong(&ok);
    if (!ok || number < low || number > high)
        throw Error(std::string(what) + ", not \"" + FromQString(text) + "\"");
    return static_cast<int>(number);
}

} // namespace

ViewerOptions ViewerOptions::Parse(const QStringList& arguments) {
    QCommandLineParser parser;
    Describe(parser);
    if (!parser.parse(arguments))
        throw Error(FromQString(parser.errorText()));
    ViewerOptions options;
    options.help = parser.isSet("help");
    QStringList positional = parser.positionalArguments();
    if (positional.size() > 1)
        throw Error("Give at most one company directory");
    if (!positional.isEmpty())
        options.compDir = positional.front();
    options.type = Number(parser.value(kType), std::numeric_limits<int16_t>::min(),
                          std::numeric_limits<int16_t>::max(), "--type takes a document type code");
    options.start = Number(parser.value(kStart), 1, std::numeric_limits<int32_t>::max(),
                           "--start takes a record number of 1 or more");
    return options;
}

QString ViewerOptions::HelpText() {
    QCommandLineParser parser;
    Describe(parser);
    return parser.helpText();
}

} // namespace dovrel
