#pragma once

// Test data: every test writes the company it needs with the sample-company
// writer into a private temporary directory that is removed afterwards.

#include "control/Card.h"
#include "platform/Encoding.h"
#include "platform/SettingsStore.h"
#include "tools/SampleWriter.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <memory>
#include <optional>
#include <random>
#include <string>
#include <string_view>
#include <vector>

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

// An environment variable set for the life of the object, then put back.
class ScopedEnv {
public:
    ScopedEnv(const char* name, const std::string& value) : name_(name) {
        if (const char* old = std::getenv(name))
            saved_ = old;
        setenv(name, value.c_str(), 1);
    }
    ~ScopedEnv() { saved_ ? setenv(name_, saved_->c_str(), 1) : unsetenv(name_); }
    ScopedEnv(const ScopedEnv&) = delete;
    ScopedEnv& operator=(const ScopedEnv&) = delete;

private:
    const char* name_;
    std::optional<std::string> saved_;
};

// A company directory written from a JSON description (tools/README.md).
class TestCompany {
public:
    explicit TestCompany(std::string_view descriptionJson) {
        sample::WriteCompany(descriptionJson, dir_.path());
    }
    const std::filesystem::path& path() const { return dir_.path(); }
    // The company path as the control holds it (code page 1255).
    std::string compPath() const { return FromUtf8(Utf8(dir_.str())); }
    std::filesystem::path file(const std::string& name) const { return dir_.path() / name; }

private:
    TempDir dir_;
};

// UTF-8 literal to the core's code page 1255, and back.
inline std::string W(std::string_view utf8) {
    return FromUtf8(Utf8(utf8));
}
inline std::string U(std::string_view cp1255) {
    return ToUtf8(cp1255).str();
}
inline std::string U(const Utf8& text) {
    return text.str();
}

inline std::string ReadAll(const std::filesystem::path& path) {
    std::ifstream in(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

// A file of n records of length len whose record r is filled with byte r % 251,
// followed by `extra` bytes that make no whole record.
inline void WriteNumbered(const std::filesystem::path& path, int n, size_t len, size_t extra = 0) {
    std::ofstream out(path, std::ios::binary);
    for (int r = 1; r <= n; ++r)
        out << std::string(len, static_cast<char>(r % 251));
    out << std::string(extra, 'x');
}

// Pieces of a company description (tools/README.md).
inline nlohmann::json Line(const std::string& key, const std::string& description,
                           double price = 10, double quantity = 1) {
    return {{"key", key}, {"description", description}, {"price", price}, {"quantity", quantity}};
}

inline nlohmann::json Doc(int type, const std::string& reference, const std::string& customer,
                          std::vector<nlohmann::json> lines = {}) {
    return {{"type", type},      {"reference", reference}, {"customer", customer},
            {"account", "1001"}, {"date", "2024-03-15"},   {"lines", lines}};
}

inline nlohmann::json Filler(const std::string& file, int count) {
    return {{"file", file}, {"filler", count}};
}

// A Card on a private module state, with a message box that records, reading
// a company written from a description.
class CardFixture : public ::testing::Test {
protected:
    static constexpr int16_t kDeliveryRow = 13; // type 20, ISHP.FIX

    void SetUp() override { card = std::make_unique<Card>(messages, state); }
    void write(const nlohmann::json& description) {
        company = std::make_unique<TestCompany>(description.dump());
    }
    // Reads with the card's own search, as the host does.
    int32_t read(std::string direction, int16_t row = kDeliveryRow,
                 std::string fromDate = "01/01/1980") {
        return card->ReadStock(company->compPath(), row, card->PubSearchBy, card->PubSearchValue,
                               direction, fromDate);
    }
    std::string box(const TextBox& b) const { return U(b.Text()); }
    std::string cell(int row, int col) const { return U(card->DocLines.TextMatrix(row, col)); }
    std::vector<std::string> gridRow(int row) const {
        std::vector<std::string> cells;
        for (int col = 0; col < card->DocLines.Cols(); ++col)
            cells.push_back(cell(row, col));
        return cells;
    }
    std::string lastMessage() const {
        return messages.shown().empty() ? std::string() : U(messages.shown().back().text);
    }

    ModuleState state;
    RecordedMessages messages;
    std::unique_ptr<Card> card;
    std::unique_ptr<TestCompany> company;
};

// Shows a form and runs what the user does while it is open; then the window
// closes as its close button would.
template <class F = Form> class ScriptedForms : public FormPresenter {
public:
    void ShowModal(Form& form) override {
        form.Show();
        if (user)
            user(dynamic_cast<F&>(form));
        if (form.Visible())
            form.QueryClose();
    }
    std::function<void(F&)> user;
};

// What a Card is started with: recorders and fixed values, forms shown to a script.
template <class F = Form> struct CardDesk {
    RecordedMessages messages;
    MemorySettingsStore settings;
    ScriptedForms<F> forms;
    MemoryClipboard clipboard;
    RecordingBrowser browser;
    FixedClock clock{{2026, 12, 6}};
    CardServices services{messages, settings, forms, clipboard, browser, clock};
    ModuleState state;

    // The messages shown since the last look, as "title: text".
    std::vector<std::string> shown() {
        std::vector<std::string> texts;
        for (const RecordedMessages::Shown& m : messages.take())
            texts.push_back(m.title.str() + ": " + m.text.str());
        return texts;
    }
};

} // namespace dovrel::test
