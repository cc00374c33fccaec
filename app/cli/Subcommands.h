#pragma once

#include <CLI/CLI.hpp>

#include <functional>

namespace dovrel {

// The work of the chosen sub-command; returns the exit code.
using Runner = std::function<int()>;

// Each registers its sub-command's options and, when it is chosen, sets the
// work to run.
void AddPrint(CLI::App& app, Runner& run);
void AddCompanies(CLI::App& app, Runner& run);
void AddAccount(CLI::App& app, Runner& run);
void AddPictures(CLI::App& app, Runner& run);

} // namespace dovrel
