#include "platform/SettingsStore.h"

#include "ChildFailure.h"
#include "TestCompany.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sqlite3.h>

#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <memory>
#include <optional>
#include <type_traits>

namespace dovrel {
namespace {

using test::BecomeNobody;
using test::FailureInChild;
using test::FailureOf;
using test::W;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Pair;

// The same behaviour is asked of both stores.
template <typename Store> class EveryStoreTest : public ::testing::Test {
protected:
    test::TempDir dir;
    std::unique_ptr<SettingsStore> store = [this]() -> std::unique_ptr<SettingsStore> {
        if constexpr (std::is_same_v<Store, SqliteSettingsStore>)
            return std::make_unique<Store>(dir.str() + "/dovrel/settings.db");
        else
            return std::make_unique<Store>();
    }();
};
using Stores = ::testing::Types<MemorySettingsStore, SqliteSettingsStore>;
TYPED_TEST_SUITE(EveryStoreTest, Stores);

TYPED_TEST(EveryStoreTest, KeepsHebrewTextMatchesNamesWithoutCaseAndKeepsPlacesApart) {
    SettingsStore& s = *this->store;
    const std::string path = W("c:\\חברה 02"), hebrewKey = W("מפתח");
    EXPECT_EQ(s.GetSetting("Dovrel", "Params", "CompPath", "c:\\comp02"), "c:\\comp02");
    EXPECT_EQ(s.FindSetting("Dovrel", "Params", "CompPath"), std::nullopt);
    s.SaveSetting("Dovrel", "Params", "CompPath", path);
    s.SaveSetting("Dovrel", "Params", "Empty", "");
    for (const char* key : {"b", "TITLE", "A"})
        s.SaveSetting("Dovrel", "Params", key, key);
    s.SaveSetting("dovrel", "PARAMS", "title", "second");
    s.SaveSetting("Dovrel", "Params", hebrewKey, W("₪"));
    s.SaveSetting("Dovrel7", "Params", "b", "other app");
    s.SaveSetting("Dovrel", "Other", "b", "other section");
    EXPECT_EQ(s.GetSetting("DOVREL", "params", "comppath", ""), path);
    EXPECT_EQ(s.FindSetting("dovrel", "Params", "EMPTY"), std::optional<std::string>(""));
    EXPECT_THAT(s.ListSettings("dovrel", "params"),
                ElementsAre(Pair("A", "A"), Pair("b", "b"), Pair("CompPath", path),
                            Pair("Empty", ""), Pair("TITLE", "second"), Pair(hebrewKey, W("₪"))));
    EXPECT_THAT(s.ListSettings("Dovrel7", "Params"), ElementsAre(Pair("b", "other app")));
    EXPECT_EQ(s.GetSetting("Dovrel", "other", "B", ""), "other section");
    EXPECT_TRUE(s.ListSettings("Dovrel8", "Params").empty());
    EXPECT_FALSE(s.DeleteSetting("Dovrel8", "Params", "b"));
    EXPECT_TRUE(s.DeleteSetting("DoVrEl", "pArAmS", "empty"));
    EXPECT_FALSE(s.DeleteSetting("Dovrel", "Params", "Empty"));
    EXPECT_THROW(s.SaveSetting("Dovrel", "Params", "", "x"), Error);
}

// The same, where file modes matter: run as root, the work runs in a child as "nobody".
std::string FailureAsUser(const std::function<void()>& work) {
    return geteuid() != 0 ? FailureOf(work) : FailureInChild(BecomeNobody, work);
}

mode_t ModeOf(const std::filesystem::path& path) {
    struct stat info {};
    return stat(path.c_str(), &info) == 0 ? info.st_mode & 07777 : 0;
}

class SqliteStoreTest : public ::testing::Test {
protected:
    test::TempDir dir;
    std::filesystem::path file = dir.path() / "cfg" / "dovrel" / "settings.db";
    SqliteSettingsStore store{file.string()};

    std::string get(const std::string& key) {
        return store.GetSetting("Dovrel", "Params", key, "");
    }
    void save(const std::string& key, const std::string& value) {
        store.SaveSetting("Dovrel", "Params", key, value);
    }
    // Every call of the store, each as work for FailureOf.
    std::vector<std::function<void()>> everyCall() {
        return {[this] { store.GetSetting("Dovrel", "Params", "CompPath", "default"); },
                [this] { save("CompPath", "x"); },
                [this] { store.ListSettings("Dovrel", "Params"); },
                [this] { store.DeleteSetting("Dovrel", "Params", "CompPath"); }};
    }
};

TEST_F(SqliteStoreTest, ReadsCreateNothingAndTheFirstSaveMakesAPrivateFile) {
    EXPECT_EQ(get("CompPath"), "");
    EXPECT_TRUE(store.ListSettings("Dovrel", "Params").empty() &&
                !store.DeleteSetting("Dovrel", "Params", "CompPath"));
    EXPECT_FALSE(std::filesystem::exists(dir.path() / "cfg"));

    save("CompPath", "d:\\x");
    EXPECT_EQ((std::array{ModeOf(dir.path() / "cfg"), ModeOf(file.parent_path()), ModeOf(file)}),
              (std::array<mode_t, 3>{0700, 0700, 0600}));
    EXPECT_EQ(SqliteSettingsStore(file.string()).GetSetting("Dovrel", "Params", "comppath", ""),
              "d:\\x");
}

TEST_F(SqliteStoreTest, TwoConnectionsOnOneFileTheLastSaveWinsKeyByKey) {
    SqliteSettingsStore other(file.string());
    save("CompPath", "a1");
    other.SaveSetting("Dovrel", "Params", "Title", "b1");
    save("title", "a2");
    other.SaveSetting("Dovrel", "Params", "COMPPATH", "b2");
    for (SqliteSettingsStore* s : {&store, &other})
        EXPECT_THAT(s->ListSettings("Dovrel", "Params"),
                    ElementsAre(Pair("CompPath", "b2"), Pair("Title", "a2")));
}

// Twenty processes save a setting at once into a store that is not there yet.
TEST(SqliteStoreRaceTest, ManyProcessesMakeTheStoreAtOnceAndEachSaveWaitsItsTurn) {
    test::TempDir dir;
    std::string path = (dir.path() / "store" / "settings.db").string();
    std::vector<pid_t> children;
    for (int i = 0; i < 20; ++i) {
        pid_t child = fork();
        if (child == 0) {
            try {
                SqliteSettingsStore(path).SaveSetting("Dovrel", "Params", "K" + std::to_string(i),
                                                      "v");
                _exit(0);
            } catch (...) {
                _exit(1);
            }
        }
        children.push_back(child);
    }
    for (pid_t child : children) {
        int status = -1;
        waitpid(child, &status, 0);
        EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
    }
    EXPECT_EQ(SqliteSettingsStore(path).ListSettings("Dovrel", "Params").size(), 20u);
}

TEST_F(SqliteStoreTest, DefaultPathFollowsTheXdgRules) {
    test::ScopedEnv home("HOME", "/home/dana"), config("XDG_CONFIG_HOME", "");
    const std::string dana = "/home/dana/.config/dovrel/settings.db";
    for (auto [xdg, expected] : {std::pair{"/srv/conf/", "/srv/conf/dovrel/settings.db"},
                                 {"relative/conf", dana.c_str()},
                                 {"", dana.c_str()}}) {
        setenv("XDG_CONFIG_HOME", xdg, 1);
        EXPECT_EQ(SqliteSettingsStore::DefaultPath(), expected) << xdg;
    }
    unsetenv("XDG_CONFIG_HOME");
    EXPECT_EQ(SqliteSettingsStore().path(), dana);
}

TEST_F(SqliteStoreTest, ADamagedFileOrADirectoryIsAnErrorNamingTheFile) {
    std::filesystem::create_directories(file.parent_path());
    const std::string garbage(3000, '\x5a');
    std::ofstream(file, std::ios::binary) << garbage;
    EXPECT_THAT(FailureOf(everyCall()[0]), HasSubstr("Cannot read setting \"CompPath\" from " +
                                                     file.string() + ": file is not a database"));
    for (bool directory : {false, true}) {
        for (const auto& work : everyCall())
            EXPECT_THAT(FailureOf(work), HasSubstr(file.string())) << directory;
        if (!directory) {
            EXPECT_EQ(test::ReadAll(file), garbage);
            std::filesystem::remove(file);
            std::filesystem::create_directory(file);
        }
    }
}

TEST_F(SqliteStoreTest, AReadOnlyDirectoryFailsTheSaveAndLosesNothing) {
    const std::string failed = "Cannot save setting \"CompPath\" to " + file.string() + ": ";
    std::filesystem::create_directories(dir.path() / "cfg");
    chmod((dir.path() / "cfg").c_str(), 0555);
    EXPECT_THAT(FailureAsUser([this] { save("CompPath", "x"); }),
                HasSubstr(failed + "cannot create the directory " + file.parent_path().string()));
    chmod((dir.path() / "cfg").c_str(), 0755);

    save("CompPath", "kept");
    chmod(file.c_str(), 0444);
    chmod(file.parent_path().c_str(), 0555);
    EXPECT_THAT(FailureAsUser([this] { save("CompPath", "new"); }),
                HasSubstr(failed + "attempt to write a readonly database"));
    EXPECT_EQ(FailureAsUser([this] { get("CompPath"); }), "");
    chmod(file.parent_path().c_str(), 0700);
    EXPECT_EQ(get("CompPath"), "kept");
}

// A full disk: in a child whose files may not grow past their present size, a
// save that needs more room fails plainly, and every stored value stays.
TEST_F(SqliteStoreTest, AFullDiskFailsTheSaveAndLosesNothing) {
    save("CompPath", "kept");
    auto size = static_cast<rlim_t>(std::filesystem::file_size(file));
    std::string failure = FailureInChild(
        [size] {
            rlimit limit{size, size};
            return signal(SIGXFSZ, SIG_IGN) != SIG_ERR && setrlimit(RLIMIT_FSIZE, &limit) == 0;
        },
        [this] { save("Big", std::string(1 << 20, 'x')); });
    EXPECT_THAT(failure, HasSubstr("Cannot save setting \"Big\" to " + file.string()));
    EXPECT_EQ(get("CompPath"), "kept");
    EXPECT_FALSE(store.FindSetting("Dovrel", "Params", "Big"));
    save("CompPath", "after");
    EXPECT_EQ(get("CompPath"), "after");
}

TEST_F(SqliteStoreTest, ALockHeldPastTheTimeoutFailsAndLosesNothing) {
    save("CompPath", "old");
    save("Title", "old title");
    store.setBusyTimeout(std::chrono::milliseconds(50));
    sqlite3* holder = nullptr;
    sqlite3_open(file.c_str(), &holder);
    std::unique_ptr<sqlite3, int (*)(sqlite3*)> closer(holder, sqlite3_close);
    auto exec = [holder](const char* sql) {
        return sqlite3_exec(holder, sql, nullptr, nullptr, nullptr);
    };
    ASSERT_EQ(exec("BEGIN IMMEDIATE; UPDATE settings SET value = 'held'"), SQLITE_OK);
    EXPECT_THAT(FailureOf(everyCall()[1]), HasSubstr(file.string() + ": database is locked"));
    EXPECT_NE(FailureOf([this] { store.DeleteSetting("Dovrel", "Params", "Title"); }), "");
    // Readers still see the last committed values while the other writes.
    EXPECT_EQ(get("CompPath"), "old");

    ASSERT_EQ(exec("ROLLBACK; BEGIN EXCLUSIVE"), SQLITE_OK);
    for (size_t read : {0u, 2u})
        EXPECT_NE(FailureOf(everyCall()[read]), "") << read;
    ASSERT_EQ(exec("ROLLBACK"), SQLITE_OK);
    EXPECT_THAT(store.ListSettings("Dovrel", "Params"),
                ElementsAre(Pair("CompPath", "old"), Pair("Title", "old title")));
}

} // namespace
} // namespace dovrel
