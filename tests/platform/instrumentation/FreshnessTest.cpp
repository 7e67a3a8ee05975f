// When a snapshot is taken anew, and what the refresh handshake sees.
#include "FakeFiles.h"
#include "StoreListing.h"

#include <gmock/gmock.h>

#include <cerrno>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;

constexpr std::int64_t millisecond = 1'000'000;
constexpr std::int64_t second = 1000 * millisecond;
constexpr std::int64_t day = 86'400 * second;
const std::string passwd = "/r/etc/passwd";
const std::string twoAccounts = "alice:x:1000:1000::/home/alice:/bin/sh\nbob:x:1:1:::\n";

class Freshness : public testing::Test {
protected:
    FakeFiles files;
    std::shared_ptr<NodeStore> store = makeStore("accounts:/r", files);

    std::vector<std::string> accounts() { return namesOf(store, UserAccount); }
    int passwdReads() { return files.reads[passwd]; }
    void refresh() {
        NodeCursor administration(store);
        administration.select(UserAdministration);
        EXPECT_TRUE(administration.write(RefreshRequest, 0U));
    }
};

unsigned int entryCount(const NodeCursor& cursor) {
    unsigned int count = 0;
    EXPECT_TRUE(cursor.read(EntryCount, count));
    return count;
}

} // namespace

TEST_F(Freshness, Unchanged_files_are_read_once) {
    for (int request = 0; request < 10; ++request) {
        EXPECT_THAT(accounts(), ElementsAre("alice"));
    }
    EXPECT_EQ(passwdReads(), 1);
}

TEST_F(Freshness, All_cursors_share_one_snapshot) { EXPECT_EQ(store->current(), store->current()); }

TEST_F(Freshness, Each_file_that_changes_is_seen_by_the_next_selection) {
    accounts();
    files.put("/r/etc/passwd", twoAccounts);
    EXPECT_THAT(accounts(), ElementsAre("alice", "bob"));
    files.put("/r/etc/shadow", "alice:!:19000:0:99999:7:::\n");
    EXPECT_EQ(accountNumber(store, "alice", AccountState), 16U);
    files.put("/r/etc/group", "users:x:1000:alice\nnew:x:1:\n");
    EXPECT_THAT(namesOf(store, UserGroup), ElementsAre("users", "new"));
    files.put("/r/etc/security/faillock.conf", "deny = 7\n");
    EXPECT_EQ(accountNumber(store, "alice", MaxLoginFailures), 7U);
    files.remove("/r/etc/shadow");
    EXPECT_EQ(accountNumber(store, "alice", AccountState), std::nullopt);
}

TEST_F(Freshness, A_change_that_keeps_the_count_is_seen) {
    accounts();
    files.put(passwd, "alice:x:1000:1000::/home/alice:/bin/zs\n");
    EXPECT_EQ(accountText(store, "alice", ScriptPath), "/bin/zs");
}

TEST_F(Freshness, A_cursor_keeps_the_snapshot_that_it_was_selected_from) {
    NodeCursor cursor(store);
    cursor.select(UserAccount);
    files.put(passwd, "carol:x:1:1:::\n");
    EXPECT_THAT(accounts(), ElementsAre("carol"));
    std::string name;
    EXPECT_TRUE(cursor.read(Name, name));
    EXPECT_EQ(name, "alice");
    EXPECT_EQ(cursor.size(), 1U);
}

TEST_F(Freshness, Entry_count_is_what_the_database_holds_now) {
    NodeCursor cursor(store);
    cursor.select(UserAccount);
    EXPECT_EQ(entryCount(cursor), 1U);
    files.put(passwd, twoAccounts);
    EXPECT_EQ(entryCount(cursor), 2U);
    EXPECT_EQ(cursor.size(), 1U);
    files.put(passwd, "");
    EXPECT_EQ(entryCount(cursor), 0U);
}

TEST_F(Freshness, Entry_count_of_groups_counts_groups) {
    NodeCursor cursor(store);
    cursor.select(UserGroup);
    files.put(passwd, twoAccounts);
    EXPECT_EQ(entryCount(cursor), 1U);
    files.put("/r/etc/group", "a:x:1:\nb:x:2:\nc:x:3:\n");
    EXPECT_EQ(entryCount(cursor), 3U);
}

TEST_F(Freshness, Counting_does_not_read_unchanged_files) {
    NodeCursor cursor(store);
    cursor.select(UserAccount);
    for (int i = 0; i < 5; ++i) {
        entryCount(cursor);
    }
    EXPECT_EQ(passwdReads(), 1);
}

TEST_F(Freshness, A_refresh_request_reads_files_that_seem_unchanged) {
    accounts();
    files.changeUnseen(passwd, twoAccounts);
    EXPECT_THAT(accounts(), ElementsAre("alice"));
    refresh();
    EXPECT_THAT(accounts(), ElementsAre("alice", "bob"));
}

TEST_F(Freshness, Only_a_zero_on_the_administration_node_is_a_refresh_request) {
    NodeCursor cursor(store);
    cursor.select(UserAdministration);
    EXPECT_FALSE(cursor.write(RefreshRequest, 1U));
    EXPECT_FALSE(cursor.write(RefreshRequest, std::string("0")));
    cursor.select(UserAccount);
    EXPECT_FALSE(cursor.write(RefreshRequest, 0U));
    cursor.clear();
    EXPECT_FALSE(cursor.write(RefreshRequest, 0U));
    EXPECT_EQ(passwdReads(), 1);
}

TEST_F(Freshness, A_file_changed_a_moment_before_it_was_read_is_read_again) {
    files.setChanged(passwd, files.time - 5 * millisecond);
    EXPECT_THAT(accounts(), ElementsAre("alice"));
    files.changeUnseen(passwd, twoAccounts);
    files.time += second;
    EXPECT_THAT(accounts(), ElementsAre("alice", "bob"));
    accounts();
    EXPECT_EQ(passwdReads(), 2);
}

TEST_F(Freshness, Whole_second_stamps_are_trusted_only_after_a_while) {
    files.time = 1'700'000'000 * second + 800 * millisecond;
    files.setChanged(passwd, 1'700'000'000 * second);
    accounts();
    files.changeUnseen(passwd, twoAccounts);
    EXPECT_THAT(accounts(), ElementsAre("alice", "bob"));
    files.time += 3 * second;
    accounts();
    const int reads = passwdReads();
    accounts();
    EXPECT_EQ(passwdReads(), reads);
}

TEST_F(Freshness, A_clock_set_back_does_not_make_every_request_read) {
    files.setChanged(passwd, files.time + day);
    accounts();
    accounts();
    EXPECT_EQ(passwdReads(), 1);
}

TEST_F(Freshness, An_account_expires_at_midnight_without_any_file_changing) {
    const std::int64_t today = files.time / day;
    files.put("/r/etc/shadow", "alice:h:1:0:9:7::" + std::to_string(today + 1) + ":\n");
    EXPECT_EQ(accountNumber(store, "alice", AccountState), 1U);
    files.time = (today + 1) * day;
    EXPECT_EQ(accountNumber(store, "alice", AccountState), 12U);
}

TEST_F(Freshness, A_passing_read_failure_is_tried_again_on_the_next_request) {
    files.failRead(passwd, EMFILE);
    EXPECT_NE(errorOf([this] { accounts(); }), "");
    files.failRead(passwd, 0);
    EXPECT_THAT(accounts(), ElementsAre("alice"));
}

TEST_F(Freshness, A_lasting_read_failure_is_not_tried_until_the_file_changes) {
    files.failRead(passwd, EACCES);
    for (int request = 0; request < 3; ++request) {
        EXPECT_NE(errorOf([this] { accounts(); }), "");
    }
    EXPECT_EQ(passwdReads(), 1);
    files.put(passwd, twoAccounts);
    EXPECT_THAT(accounts(), ElementsAre("alice", "bob"));
}

TEST_F(Freshness, Files_replaced_while_the_others_are_read_are_read_again) {
    bool replaced = false;
    files.afterRead = [&](const std::string& path) {
        if (path != "/r/etc/shadow" || replaced) {
            return;
        }
        replaced = true;
        files.put(passwd, twoAccounts);
        files.put("/r/etc/shadow", "alice:h:1:0:9:7:::\nbob:!:1:0:9:7:::\n");
    };
    EXPECT_EQ(accountNumber(store, "bob", AccountState), 16U);
}

TEST_F(Freshness, Files_that_change_with_every_look_do_not_hold_up_a_request) {
    files.afterRead = [&](const std::string& path) {
        if (path == passwd) {
            files.put(passwd, twoAccounts);
        }
    };
    EXPECT_EQ(accounts().size(), 2U);
    EXPECT_LE(passwdReads(), 3);
}

TEST_F(Freshness, A_vanished_database_is_an_error_and_not_an_empty_system) {
    accounts();
    files.remove(passwd);
    EXPECT_NE(errorOf([this] { accounts(); }), "");
    NodeCursor cursor(store);
    EXPECT_NE(errorOf([&] { cursor.select(UserAccount); }), "");
    EXPECT_FALSE(cursor.valid());
    EXPECT_EQ(cursor.size(), 0U);
}

} // namespace qelo::nodes::tests
