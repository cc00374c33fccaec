#pragma once

#include <filesystem>
#include <string>
#include <string_view>

#include <nlohmann/json.hpp>

namespace dovrel::sample {

// Writes the company directory the description asks for (see tools/README.md)
// into dir, creating it when missing. A description that does not fit the
// schema is an error (dovrel::Error) that names the offending entry.
void WriteCompany(const nlohmann::json& description, const std::filesystem::path& dir);
void WriteCompany(std::string_view descriptionJson, const std::filesystem::path& dir);
// The same for JSON text held as std::string or a literal, which would
// otherwise convert to either of the two above.
void WriteCompany(const std::string& descriptionJson, const std::filesystem::path& dir);
void WriteCompany(const char* descriptionJson, const std::filesystem::path& dir);

// Unicode text in reading order (UTF-8) as the DOS system stores it: visual
// order, DOS Hebrew letters, other characters in Windows-1255.
std::string DosVisual(std::string_view utf8);
// Unicode text already in visual order: letters mapped, order kept.
std::string DosBytes(std::string_view utf8);

} // namespace dovrel::sample
