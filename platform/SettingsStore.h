#pragma once

#include <chrono>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dovrel {

// The per-user settings store: text values (code page 1255) addressed by
// (application, section, key); all three are matched without regard to letter case.
//
// Letter case means the Latin letters A to Z: code page 1255 has no other
// letters with case. Saving a key under another spelling ("comppath" after
// "CompPath") replaces the value and keeps the spelling the key was first
// saved with; the same holds for the application and the section. An empty
// application, section or key is refused with an Error.
class SettingsStore {
public:
    using Entry = std::pair<std::string, std::string>; // key, value

    virtual ~SettingsStore() = default;
    // The stored text, or defaultValue when there is none.
    virtual std::string GetSetting(const std::string& app, const std::string& section,
                                   const std::string& key, const std::string& defaultValue) = 0;
    virtual void SaveSetting(const std::string& app, const std::string& section,
                             const std::string& key, const std::string& value) = 0;
    // Removes one key; true when there was one.
    virtual bool DeleteSetting(const std::string& app, const std::string& section,
                               const std::string& key) = 0;
    // Every (key, value) of a section, keys in the case they were first saved with, sorted
    // without regard to case.
    virtual std::vector<Entry> ListSettings(const std::string& app, const std::string& section) = 0;

    // The stored text, or nothing when there is none (unlike GetSetting, this tells an
    // empty value from a missing one).
    virtual std::optional<std::string>
    FindSetting(const std::string& app, const std::string& section, const std::string& key);

    // A name with A to Z turned into a to z: two names are the same setting when
    // their folded forms are equal.
    static std::string FoldCase(std::string_view name);

protected:
    // Sorts entries by key without regard to case (byte order of the folded keys).
    static void SortByKey(std::vector<Entry>& entries);
    // Throws when one of the three names is empty.
    static void CheckNames(const std::string& app, const std::string& section,
                           const std::string& key);
};

// In memory; tests and hosts that must not touch the user's files use it.
class MemorySettingsStore : public SettingsStore {
public:
    std::string GetSetting(const std::string& app, const std::string& section,
                           const std::string& key, const std::string& defaultValue) override;
    void SaveSetting(const std::string& app, const std::string& section, const std::string& key,
                     const std::string& value) override;
    bool DeleteSetting(const std::string& app, const std::string& section,
                       const std::string& key) override;
    std::vector<Entry> ListSettings(const std::string& app, const std::string& section) override;
    std::optional<std::string> FindSetting(const std::string& app, const std::string& section,
                                           const std::string& key) override;

private:
    // Folded application and section -> folded key -> (key as first saved, value).
    using Section = std::map<std::string, Entry>;
    std::map<std::pair<std::string, std::string>, Section> sections_;
};

// The SQLite file. The default path is $XDG_CONFIG_HOME/dovrel/settings.db, or
// ~/.config/dovrel/settings.db when XDG_CONFIG_HOME is unset or empty (or not absolute, as
// the XDG rules say).
//
// Several processes may use one file at once. Every operation opens the file, does its
// work in one transaction and closes it again; an operation that finds the file locked by
// another waits up to the busy timeout (5 seconds unless set) and then fails. The last save
// wins key by key. Values are kept as UTF-8 text. Reading a file that does not exist gives
// the defaults and creates nothing; the first save creates the directory (mode 0700) and
// the file (mode 0600). Every failure is an Error that names the file; a damaged file or
// one that cannot be read is an error, never taken for an empty store.
class SqliteSettingsStore : public SettingsStore {
public:
    static std::string DefaultPath();
    explicit SqliteSettingsStore(std::string path = DefaultPath());

    const std::string& path() const { return path_; }
    void setBusyTimeout(std::chrono::milliseconds timeout) { busyTimeout_ = timeout; }

    std::string GetSetting(const std::string& app, const std::string& section,
                           const std::string& key, const std::string& defaultValue) override;
    void SaveSetting(const std::string& app, const std::string& section, const std::string& key,
                     const std::string& value) override;
    bool DeleteSetting(const std::string& app, const std::string& section,
                       const std::string& key) override;
    std::vector<Entry> ListSettings(const std::string& app, const std::string& section) override;
    std::optional<std::string> FindSetting(const std::string& app, const std::string& section,
                                           const std::string& key) override;

private:
    void MakeDirectory(const std::string& key) const;
    void MakeFile(const std::string& key) const;

    std::string path_;
    std::chrono::milliseconds busyTimeout_{5000};
};

} // namespace dovrel
