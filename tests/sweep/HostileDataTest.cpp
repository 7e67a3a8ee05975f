// Damaged account databases, read by the real store and served by the real provider library.
#include "DamagedDatabases.h"
#include "HostileStore.h"
#include "SweepCount.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <set>
#include <sys/stat.h>

namespace qelo::test {
namespace {

namespace fs = std::filesystem;

using Place = DamagedDatabase::Place;

constexpr const char* kPasswd = "passwd";
constexpr const char* kShadow = "shadow";
constexpr const char* kGroup = "group";

// What etc/shadow tells of an account.
const std::set<std::string>& shadowProperties() {
    static const std::set<std::string> names = {"RequestedState",
                                                "EnabledState",
                                                "AccountDisable",
                                                "passwordLastChanged",
                                                "PasswordExpiration",
                                                "passwordExpirationDate",
                                                "daysMustKeepPassword",
                                                "daysExpireAfter",
                                                "daysMustChangePasswordAfter",
                                                "daysWarnBeforePasswordExpire"};
    return names;
}

class HostileData : public HostileStore {
protected:
    void SetUp() override {
        HostileStore::SetUp();
        serveAsExpected(accounts_, groups_, undamagedFiles());
        Files bare = undamagedFiles();
        bare.erase(kShadow);
        std::map<std::string, Properties> sameGroups;
        serveAsExpected(bareAccounts_, sameGroups, bare);
        ASSERT_EQ(groups_, sameGroups);
        for (const char* name : {"first", "last"}) {
            ASSERT_GE(accounts_[name].size(), 20U);
            ASSERT_NE(accounts_[name], bareAccounts_[name]);
            ASSERT_GE(groups_[name].size(), 4U);
        }
    }

    // What the two undamaged names are served as.
    void serveAsExpected(std::map<std::string, Properties>& accounts,
                         std::map<std::string, Properties>& groups, const Files& files) {
        put({"undamaged", files});
        const Served ofAccounts = enumerate(kServedClasses[0]);
        const Served ofGroups = enumerate(kServedClasses[1]);
        for (const char* name : {"first", "last"}) {
            accounts[name] = ofAccounts.propertiesOf(name);
            groups[name] = ofGroups.propertiesOf(name);
        }
    }

    // An account and a group of the database's own number come first, so that it can be told
    // from the one that was there before.
    void put(const DamagedDatabase& database) {
        mark_ = "seen" + std::to_string(++count_);
        const fs::path etc = root() / "etc";
        fs::remove_all(etc);
        for (const auto& [name, content] : database.files) {
            fs::create_directories((etc / name).parent_path());
            std::ofstream(etc / name, std::ios::binary) << markOf(name, content) << content;
        }
        fs::create_directories((etc / database.placeOf).parent_path());
        makePlace(database.place, etc / database.placeOf);
    }

    std::string markOf(const std::string& file, const std::string& content) const {
        if (content.empty()) {
            return "";
        }
        return file == kPasswd  ? mark_ + ":x:3000:3000:::\n"
               : file == kGroup ? mark_ + ":x:3000:\n"
                                : "";
    }

    static void makePlace(Place place, const fs::path& path) {
        switch (place) {
        case Place::File:
            break;
        case Place::Directory:
            fs::create_directory(path);
            break;
        case Place::Pipe:
            ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
            break;
        case Place::LoopingLink:
            fs::create_symlink(path.filename(), path);
            break;
        case Place::Unreadable:
            std::ofstream(path) << "\n";
            fs::permissions(path, fs::perms::none);
            break;
        }
    }

    bool isMarked(const DamagedDatabase& database, const char* file) const {
        const auto found = database.files.find(file);
        return found != database.files.end() && !found->second.empty();
    }

    void expectMark(const DamagedDatabase& database, const char* file, const Served& served) {
        if (isMarked(database, file)) {
            EXPECT_EQ(std::count(served.names.begin(), served.names.end(), mark_), 1);
        }
    }

    static void expectServed(bool there, const char* name, const Served& served) {
        if (there) {
            EXPECT_EQ(std::count(served.names.begin(), served.names.end(), name), 1) << name;
        }
    }

    // An account whose own lines are whole has every property that it always had.
    void expectAccount(const DamagedDatabase& database, const char* name, const Served& served) {
        if (stateOfLine(database.files, kPasswd, name) != LineState::Whole) {
            return;
        }
        expectServed(true, name, served);
        const LineState shadow = stateOfLine(database.files, kShadow, name);
        const Properties& whole = accounts_.at(name);
        const Properties& bare = bareAccounts_.at(name);
        const Properties found = served.propertiesOf(name);
        EXPECT_EQ(found.size(), whole.size());
        for (const auto& [property, value] : shadow == LineState::Missing ? bare : whole) {
            const bool open =
                database.open.count(property) != 0 ||
                (shadow == LineState::Unclear && shadowProperties().count(property) != 0);
            const auto is = found.find(property);
            if (is == found.end() || (!open && is->second != value)) {
                ADD_FAILURE() << name << ": " << property << " is no more " << value << " but "
                              << (is == found.end() ? "missing" : is->second);
            }
        }
        ++compared_;
    }

    void expectGroup(const DamagedDatabase& database, const char* name, const Served& served) {
        if (stateOfLine(database.files, kGroup, name) == LineState::Whole) {
            expectServed(true, name, served);
            EXPECT_EQ(served.propertiesOf(name), groups_.at(name)) << name;
            ++compared_;
        }
    }

    // Enumerates every class both ways.
    void serve(const DamagedDatabase& database) {
        SCOPED_TRACE(database.name);
        put(database);
        EXPECT_TRUE(isMarked(database, kPasswd) || isMarked(database, kGroup));
        for (const ServedClass& kind : kServedClasses) {
            SCOPED_TRACE(kind.className);
            const Served served = enumerate(kind);
            if (kind.className == std::string("ZANTH_Account")) {
                expectMark(database, kPasswd, served);
                expectServed(database.firstAccount, "first", served);
                expectServed(database.lastAccount, "last", served);
                expectAccount(database, "first", served);
                expectAccount(database, "last", served);
            } else if (kind.className == std::string("ZANTH_Group")) {
                expectMark(database, kGroup, served);
                expectServed(database.firstGroup, "first", served);
                expectServed(database.lastGroup, "last", served);
                expectGroup(database, "first", served);
                expectGroup(database, "last", served);
            }
        }
    }

    static constexpr std::size_t kOperations = std::size(kServedClasses) * 2;

    // By the names of those whose lines are never damaged.
    std::map<std::string, Properties> accounts_;
    std::map<std::string, Properties> bareAccounts_; // without a line in shadow
    std::map<std::string, Properties> groups_;
    std::string mark_;
    std::size_t count_ = 0;
    std::size_t compared_ = 0; // instances
};

TEST_F(HostileData, Of_every_kind_keeps_the_undamaged_lines) {
    std::size_t read = 0;
    const std::vector<DamagedDatabase> all = damagedDatabases();
    for (const DamagedDatabase& database : all) {
        read += database.isRead ? 1 : 0;
        serve(database);
    }
    EXPECT_GE(read, 1000U);
    EXPECT_GE(compared_, all.size() * 7 / 2);
    countFaults("damaged databases", kOperations, read);
    countFaults("damaged files that enumerations do not read (gshadow)", kOperations,
                all.size() - read);
}

TEST_F(HostileData, At_random_keeps_the_undamaged_lines) {
    const std::uint32_t count = isLongSweep() ? 20000 : 1000;
    for (std::uint32_t seed = 1; seed <= count; ++seed) {
        serve(randomlyDamaged(seed));
    }
    EXPECT_GE(compared_, count * std::size_t{3});
    countFaults("randomly damaged databases", kOperations, count);
}

} // namespace
} // namespace qelo::test
