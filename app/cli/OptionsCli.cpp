#include "app/cli/PrintCommand.h"
#include "app/cli/Subcommands.h"
#include "fixfiles/DocTypes.h"
#include "platform/Encoding.h"

#include <cctype>
#include <charconv>

namespace dovrel {

namespace {

std::string Folded(std::string text) {
    for (char& c : text)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return text;
}

// The filled rows of the document-type table.
std::vector<DocTypeRow> DocTypeRows() {
    DocTypeTable types;
    DocFileTable files;
    InitDocTypes(types, files);
    std::vector<DocTypeRow> rows;
    for (const DocTypeRow& row : types)
        if (!row.hebrewTitle.empty())
            rows.push_back(row);
    return rows;
}

// The code of a type given by its code, English name or Hebrew title; an
// error message that lists the valid ones otherwise.
std::string TypeToCode(std::string& text) {
    std::vector<DocTypeRow> rows = DocTypeRows();
    int code = -1;
    auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), code);
    bool number = ec == std::errc() && end == text.data() + text.size();
    for (const DocTypeRow& row : rows) {
        if ((number && row.code == code) || Folded(text) == Folded(row.englishTitle) ||
            text == ToUtf8(row.hebrewTitle).str()) {
            text = std::to_string(row.code);
            return "";
        }
    }
    return "not a document type: " + text + " (see --help for the codes, names and titles)";
}

std::string TypeList() {
    std::string list = "Document type: a code, its English name or its Hebrew title (default 20)."
                       " The types:";
    for (const DocTypeRow& row : DocTypeRows())
        list += "\n  " + std::to_string(row.code) + "  " + row.englishTitle + "  " +
                ToUtf8(row.hebrewTitle).str();
    return list;
}

} // namespace

void AddTypeOption(CLI::App& command, int16_t& type) {
    command.add_option("--type", type, TypeList())
        ->type_name("TYPE")
        ->transform(CLI::Validator(TypeToCode, "", "document type"));
}

void AddTypesOption(CLI::App& command, std::vector<int16_t>& types) {
    command.add_option("--type", types, TypeList())
        ->type_name("TYPE")
        ->take_all()
        ->transform(CLI::Validator(TypeToCode, "", "document type"));
}

void AddTodayOption(CLI::App& command, std::string& today, const std::string& about) {
    command.add_option("--today", today, about)
        ->type_name("YYYY-MM-DD")
        ->check(CLI::Validator(
            [](std::string& text) {
                try {
                    PrintCommand::ParseDay(text);
                    return std::string();
                } catch (const std::exception& e) {
                    return std::string(e.what());
                }
            },
            "", "date"));
}

} // namespace dovrel
