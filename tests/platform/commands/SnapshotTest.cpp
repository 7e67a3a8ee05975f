// Putting entries back as they were.
#include "CommandTest.h"
#include "EntrySnapshot.h"
#include "PosixFileSystem.h"

#include <cerrno>

namespace qelo::test {

namespace {

using store::EntrySnapshot;
using store::RootDirectory;

// Lets a number of files be replaced and then no more, as on a disk that has become full.
class FewRenames : public store::PosixFileSystem {
public:
    explicit FewRenames(int count) : left_(count) {}
    bool rename(int fromDirectory, const std::string& from, int toDirectory,
                const std::string& to) override {
        if (left_-- <= 0) {
            errno = ENOSPC;
            return false;
        }
        return PosixFileSystem::rename(fromDirectory, from, toDirectory, to);
    }

private:
    int left_;
};

class Snapshot : public CommandTest {
protected:
    Snapshot() : opened_(RootDirectory::open(root(), files_)) {
        accept("CreateUser", {text("Name", "zoe")});
        accept("AddMember", {text("Name", "users"), text("Member", "zoe")});
        without_ = stateOf(root());
        accept("CreateUser", {text("Name", "alice")});
        accept("CreateUser", {text("Name", "last")});
        accept("AddMember", {text("Name", "users"), text("Member", "alice")});
        accept("AddMember", {text("Name", "users"), text("Member", "last")});
        with_ = stateOf(root());
    }

    EntrySnapshot take() {
        auto snapshot = EntrySnapshot::take(*opened_, files_, "alice", "alice");
        EXPECT_TRUE(snapshot);
        return *snapshot;
    }

    // Restores with ever more files that can be written; every stop must be a safe one.
    void expectSafeStops(const std::map<std::string, std::string>& from,
                         const std::map<std::string, std::string>& to) {
        for (int renames = 0; renames <= 6; ++renames) {
            FewRenames files(renames);
            putFiles(to);
            const auto snapshot = EntrySnapshot::take(*opened_, files, "alice", "alice");
            ASSERT_TRUE(snapshot);
            putFiles(from);
            EXPECT_EQ(renames < 6, snapshot->restore().has_value());
            EXPECT_TRUE(passwd("alice").empty() || !shadow("alice").empty()) << renames;
        }
    }

    void putFiles(const std::map<std::string, std::string>& state) {
        for (const char* name : {"passwd", "shadow", "group", "gshadow", "subuid", "subgid"}) {
            const std::string& text = state.at(std::string("etc/") + name);
            write(etc(name), text.substr(text.find('\n') + 1));
        }
    }

    store::PosixFileSystem files_;
    store::Attempt<RootDirectory> opened_;
    std::map<std::string, std::string> without_;
    std::map<std::string, std::string> with_;
};

} // namespace

TEST_F(Snapshot, Brings_back_what_was_deleted_at_its_old_place) {
    const EntrySnapshot before = take();
    accept("DeleteUser", {text("Name", "alice")});
    EXPECT_NE(with_, stateOf(root()));
    EXPECT_FALSE(before.restore());
    EXPECT_EQ(with_, stateOf(root()));
}

TEST_F(Snapshot, Takes_away_what_was_not_there) {
    const EntrySnapshot before = take();
    accept("DeleteUser", {text("Name", "alice")});
    const auto deleted = stateOf(root());
    const auto none = EntrySnapshot::take(*opened_, files_, "alice", "alice");
    EXPECT_FALSE(before.restore());
    EXPECT_FALSE(none->restore());
    EXPECT_EQ(deleted, stateOf(root()));
}

TEST_F(Snapshot, Leaves_what_others_did_in_the_meantime) {
    const EntrySnapshot before = take();
    accept("DeleteUser", {text("Name", "alice")});
    accept("DeleteUser", {text("Name", "last")});
    accept("CreateUser", {text("Name", "late"), number("UserID", 1500)});
    accept("AddMember", {text("Name", "users"), text("Member", "late")});
    accept("CreateGroup", {text("Name", "other")});
    EXPECT_FALSE(before.restore());
    EXPECT_EQ(lineOf(etc("passwd"), "alice").at(0), "alice");
    EXPECT_TRUE(passwd("last").empty());
    EXPECT_FALSE(passwd("late").empty());
    EXPECT_EQ("zoe,alice,late", group("users").at(3));
    EXPECT_EQ("zoe,alice,late", lineOf(etc("gshadow"), "users").at(3));
    EXPECT_FALSE(group("other").empty());
}

TEST_F(Snapshot, Writes_nothing_when_nothing_differs) {
    const EntrySnapshot before = take();
    const auto times = [&] { return std::filesystem::last_write_time(root() / "etc"); };
    const auto then = times();
    EXPECT_FALSE(before.restore());
    EXPECT_EQ(then, times());
}

TEST_F(Snapshot, Never_shows_an_account_without_its_shadow_line) {
    expectSafeStops(without_, with_);
    expectSafeStops(with_, without_);
    putFiles(with_);
}

} // namespace qelo::test
