#pragma once

#include <CLI/CLI.hpp>

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

namespace dovrel {

// The work of the chosen sub-command; returns the exit code.
using Runner = std::function<int()>;

// Each registers its sub-command's options and, when it is chosen, sets the
// work to run.
void AddPrint(CLI::App& app, Runner& run);
void AddCompanies(CLI::App& app, Runner& run);
void AddAccount(CLI::App& app, Runner& run);
void AddPictures(CLI::App& app, Runner& run);
void AddServe(CLI::App& app, Runner& run);
void AddExport(CLI::App& app, Runner& run);

// --type: a document type's code, English name or Hebrew title; the help
// lists them all, and anything else is a usage error.
void AddTypeOption(CLI::App& command, int16_t& type);
// --type given any number of times.
void AddTypesOption(CLI::App& command, std::vector<int16_t>& types);
// --today YYYY-MM-DD, a real day of the calendar.
void AddTodayOption(CLI::App& command, std::string& today, const std::string& about);

} // namespace dovrel
