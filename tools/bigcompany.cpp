// dovrel-bigcompany DIR --doc-bytes N --items N --accounts N [--seed S]
// [--type-mix TYPE:WEIGHT,...]: writes a large company for the benchmarks.

#include "tools/BigCompany.h"

#include <CLI/CLI.hpp>

#include <exception>
#include <iostream>
#include <string>

int main(int argc, char** argv) {
    CLI::App app{"Writes a large company of the accounting system for measuring the readers."};
    std::string dir;
    std::string mix;
    dovrel::sample::BigCompanyOptions options;
    app.add_option("DIR", dir, "The company directory to write (created when missing)")->required();
    app.add_option("--doc-bytes", options.docBytes,
                   "Size of each document file the type mix writes to (at most 1 GiB)")
        ->required();
    app.add_option("--items", options.items, "Number of items in ITM.fix")->required();
    app.add_option("--accounts", options.accounts, "Number of accounts in ACT.fix")->required();
    app.add_option("--seed", options.seed, "Seed: the same seed writes the same files");
    app.add_option("--type-mix", mix,
                   "Document types and their shares, as 1:40,2:15,5:8 (default: every type "
                   "of IMV.FIX)");
    CLI11_PARSE(app, argc, argv);
    try {
        if (!mix.empty())
            options.typeMix = dovrel::sample::ParseTypeMix(mix);
        dovrel::sample::BigCompany company(options);
        company.write(dir, [](const std::string& message) { std::cerr << message << "\n"; });
    } catch (const std::exception& e) {
        std::cerr << "dovrel-bigcompany: " << e.what() << "\n";
        return 1;
    }
    return 0;
}
