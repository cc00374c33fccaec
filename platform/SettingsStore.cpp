#include "platform/SettingsStore.h"

#include "platform/Ascii.h"

#include "platform/Error.h"

#include <algorithm>

namespace dovrel {

std::optional<std::string> SettingsStore::FindSetting(const std::string& app,
                                                      const std::string& section,
                                                      const std::string& key) {
    std::string folded = FoldCase(key);
    for (auto& [name, value] : ListSettings(app, section))
        if (FoldCase(name) == folded)
            return std::move(value);
    return std::nullopt;
}

std::string SettingsStore::FoldCase(std::string_view name) {
    return AsciiFold(name);
}

void SettingsStore::SortByKey(std::vector<Entry>& entries) {
    std::sort(entries.begin(), entries.end(), [](const Entry& a, const Entry& b) {
        // Byte order as unsigned values, so that Hebrew sorts after Latin.
        std::string x = FoldCase(a.first), y = FoldCase(b.first);
        return std::lexicographical_compare(
            x.begin(), x.end(), y.begin(), y.end(), [](char l, char r) {
                return static_cast<unsigned char>(l) < static_cast<unsigned char>(r);
            });
    });
}

void SettingsStore::CheckNames(const std::string& app, const std::string& section,
                               const std::string& key) {
    if (app.empty() || section.empty() || key.empty())
        throw Error("A setting needs an application name, a section and a key");
}

std::string MemorySettingsStore::GetSetting(const std::string& app, const std::string& section,
                                            const std::string& key,
                                            const std::string& defaultValue) {
    return FindSetting(app, section, key).value_or(defaultValue);
}

void MemorySettingsStore::SaveSetting(const std::string& app, const std::string& section,
                                      const std::string& key, const std::string& value) {
    CheckNames(app, section, key);
    Section& entries = sections_[{FoldCase(app), FoldCase(section)}];
    auto [found, added] = entries.try_emplace(FoldCase(key), key, value);
    if (!added)
        found->second.second = value;
}

bool MemorySettingsStore::DeleteSetting(const std::string& app, const std::string& section,
                                        const std::string& key) {
    CheckNames(app, section, key);
    auto found = sections_.find({FoldCase(app), FoldCase(section)});
    return found != sections_.end() && found->second.erase(FoldCase(key)) > 0;
}

std::vector<SettingsStore::Entry> MemorySettingsStore::ListSettings(const std::string& app,
                                                                    const std::string& section) {
    std::vector<Entry> entries;
    auto found = sections_.find({FoldCase(app), FoldCase(section)});
    if (found != sections_.end())
        for (const auto& [folded, entry] : found->second)
            entries.push_back(entry);
    SortByKey(entries);
    return entries;
}

std::optional<std::string> MemorySettingsStore::FindSetting(const std::string& app,
                                                            const std::string& section,
                                                            const std::string& key) {
    CheckNames(app, section, key);
    auto found = sections_.find({FoldCase(app), FoldCase(section)});
    if (found == sections_.end())
        return std::nullopt;
    auto entry = found->second.find(FoldCase(key));
    if (entry == found->second.end())
        return std::nullopt;
    return entry->second.second;
}

} // namespace dovrel
