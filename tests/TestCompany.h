#pragma once

// Test data: every test writes the company it needs with the sample-company
// writer into a private temporary directory that is removed afterwards.

#include "platform/Encoding.h"
#include "tools/SampleWriter.h"

#include <filesystem>
#include <random>
#include <string>
#include <string_view>

namespace dovrel::test {

class TempDir {
public:
    TempDir() {
        std::random_device rd;
        path_ = std::filesystem::temp_directory_path() /
                ("dovrel-test-" + std::to_string(rd()) + std::to_string(rd()));
        std::filesystem::create_directories(path_);
    }
    ~TempDir() {
        std::error_code ec;
        std::filesystem::remove_all(path_, ec);
    }
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;

    const std::filesystem::path& path() const { return path_; }
    std::string str() const { return path_.string(); }

private:
    std::filesystem::path path_;
};

// A company directory written from a JSON description (tools/README.md).
class TestCompany {
public:
    explicit TestCompany(std::string_view descriptionJson) {
        sample::WriteCompany(descriptionJson, dir_.path());
    }
    const std::filesystem::path& path() const { return dir_.path(); }
    // The company path as the control holds it (code page 1255).
    std::string compPath() const { return FromUtf8(dir_.str()); }
    std::filesystem::path file(const std::string& name) const { return dir_.path() / name; }

private:
    TempDir dir_;
};

// UTF-8 literal to the core's code page 1255, and back.
inline std::string W(std::string_view utf8) { return FromUtf8(utf8); }
inline std::string U(std::string_view cp1255) { return ToUtf8(cp1255); }

} // namespace dovrel::test
