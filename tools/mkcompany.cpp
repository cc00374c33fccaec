// dovrel-mkcompany DESCRIPTION.json OUTDIR: writes a company directory of the
// accounting system from its JSON description (tools/README.md).

#include "tools/SampleWriter.h"

#include <cerrno>
#include <cstring>
#include <exception>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <sstream>
#include <string>
#include <string_view>
#include <system_error>

namespace {

constexpr char kUsage[] =
    "usage: dovrel-mkcompany DESCRIPTION.json OUTDIR\n"
    "Writes the company files that DESCRIPTION.json describes (ISHP.FIX, IORDR.FIX,\n"
    "IMV.FIX, IBD.FIX, ITM.fix, ACT.fix, adf.fix) into OUTDIR, creating it when missing.\n";

std::string ReadText(const std::string& path) {
    std::error_code ec;
    if (std::filesystem::is_directory(path, ec))
        throw std::runtime_error("cannot read " + path + ": it is a directory");
    std::ifstream in(path, std::ios::binary);
    if (!in)
        throw std::runtime_error("cannot read " + path + ": " + std::strerror(errno));
    std::ostringstream text;
    text << in.rdbuf();
    if (in.bad())
        throw std::runtime_error("cannot read " + path);
    return text.str();
}

} // namespace

int main(int argc, char** argv) {
    if (argc == 2 && (std::string_view(argv[1]) == "-h" || std::string_view(argv[1]) == "--help")) {
        std::cout << kUsage;
        return 0;
    }
    if (argc != 3) {
        std::cerr << kUsage;
        return 2;
    }
    try {
        dovrel::sample::WriteCompany(ReadText(argv[1]), argv[2]);
    } catch (const std::exception& e) {
        std::cerr << "dovrel-mkcompany: " << e.what() << "\n";
        return 1;
    }
    return 0;
}
