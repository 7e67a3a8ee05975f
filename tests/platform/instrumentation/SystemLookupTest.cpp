// What the store serves against what the system's own look-ups give for the same files.
#include "DamagedLines.h"
#include "StoreListing.h"

#include <gtest/gtest.h>

#include <grp.h>
#include <nss.h>
#include <pwd.h>
#include <set>
#include <sys/wait.h>
#include <unistd.h>

namespace qelo::nodes::tests {

namespace {

using namespace Tesk::NodeLexicon;

using Rows = std::vector<std::string>;

std::string plain(const char* text) { return text ? text : ""; }

// As a look-up by name sees the database: the first entry of a name, no network entries.
bool isSeen(const std::string& name, std::set<std::string>& known) {
    return !name.empty() && name.front() != '+' && name.front() != '-' && known.insert(name).second;
}

// "getent -s files passwd" and "getent -s files group" within this process.
Rows systemAccounts() {
    ::__nss_configure_lookup("passwd", "files");
    Rows rows;
    std::set<std::string> known;
    ::setpwent();
    while (const passwd* entry = ::getpwent()) {
        if (entry->pw_uid != UINT32_MAX && entry->pw_gid != UINT32_MAX &&
            isSeen(plain(entry->pw_name), known)) {
            rows.push_back(plain(entry->pw_name) + ":" + std::to_string(entry->pw_uid) + ":" +
                           std::to_string(entry->pw_gid) + ":" + plain(entry->pw_dir) + ":" +
                           plain(entry->pw_shell));
        }
    }
    ::endpwent();
    return rows;
}

Rows systemGroups() {
    ::__nss_configure_lookup("group", "files");
    Rows rows;
    std::set<std::string> known;
    ::setgrent();
    while (const group* entry = ::getgrent()) {
        if (entry->gr_gid == UINT32_MAX || !isSeen(plain(entry->gr_name), known)) {
            continue;
        }
        std::string row = plain(entry->gr_name) + ":" + std::to_string(entry->gr_gid) + ":";
        for (char** member = entry->gr_mem; *member; ++member) {
            row += plain(*member) + ",";
        }
        rows.push_back(row);
    }
    ::endgrent();
    return rows;
}

std::string textOf(const NodeCursor& cursor, int id) {
    std::string value;
    cursor.read(id, value);
    return value;
}

Rows servedAccounts(const std::string& choice) {
    Rows rows;
    NodeCursor cursor(makeStore(choice, systemFiles()));
    for (cursor.select(UserAccount); cursor.valid(); cursor.advance()) {
        rows.push_back(textOf(cursor, Name) + ":" + textOf(cursor, UserID) + ":" +
                       textOf(cursor, GroupId) + ":" + textOf(cursor, HomeDirectory) + ":" +
                       textOf(cursor, ScriptPath));
    }
    return rows;
}

Rows servedGroups(const std::string& choice) {
    Rows rows;
    NodeCursor cursor(makeStore(choice, systemFiles()));
    for (cursor.select(UserGroup); cursor.valid(); cursor.advance()) {
        std::string row = textOf(cursor, Name) + ":" + textOf(cursor, GroupId) + ":";
        std::vector<std::string> members;
        cursor.read(GroupMembers, members);
        for (const std::string& member : members) {
            row += member + ",";
        }
        rows.push_back(row);
    }
    return rows;
}

std::string damagedFile(const std::vector<DamagedLine>& lines, const std::string& goodRest) {
    std::string content;
    int number = 0;
    for (const DamagedLine& line : lines) {
        content += "good" + std::to_string(++number) + goodRest + "\n";
        // Replaced bytes differ from the file's by design.
        if (line.text.find_first_of("\xFF\xC3\xF0\xC2\xEF") == std::string::npos) {
            content += line.text + "\n";
        }
    }
    return content;
}

// The first row that is only in one of two lists, for a failing test to show.
std::string firstDifference(const Rows& system, const Rows& served) {
    for (std::size_t i = 0; i < system.size() || i < served.size(); ++i) {
        const std::string left = i < system.size() ? system[i] : "(end)";
        const std::string right = i < served.size() ? served[i] : "(end)";
        if (left != right) {
            return "system " + left.substr(0, 80) + ", served " + right.substr(0, 80);
        }
    }
    return {};
}

} // namespace

TEST(SystemLookup, Sees_the_same_accounts_on_this_machine) {
    const Rows system = systemAccounts();
    ASSERT_FALSE(system.empty());
    EXPECT_EQ(servedAccounts("accounts:/"), system);
}

TEST(SystemLookup, Sees_the_same_groups_on_this_machine) {
    const Rows system = systemGroups();
    ASSERT_FALSE(system.empty());
    EXPECT_EQ(servedGroups("accounts:/"), system);
}

TEST(SystemLookup, Sees_the_same_records_in_damaged_files) {
    if (::geteuid() != 0) {
        GTEST_SKIP() << "only root can put the system's look-ups onto another root directory";
    }
    const ScratchRoot root;
    root.write("etc/passwd", damagedFile(damagedAccountLines(), ":x:7:7::/h:/bin/sh"));
    root.write("etc/group", damagedFile(damagedGroupLines(), ":x:7:m"));
    const Rows accounts = servedAccounts(root.choice());
    const Rows groups = servedGroups(root.choice());
    ASSERT_GT(accounts.size(), 100U);
    ASSERT_GT(groups.size(), 50U);
    const auto compareWithin = [&] {
        if (::chroot(root.path().c_str()) != 0 || ::chdir("/") != 0) {
            ::_exit(2);
        }
        const std::string difference =
            firstDifference(systemAccounts(), accounts) + firstDifference(systemGroups(), groups);
        if (!difference.empty()) {
            (void)std::fprintf(stderr, "%s\n", difference.c_str());
        }
        ::_exit(difference.empty() ? 0 : 1);
    };
    const pid_t child = ::fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        compareWithin();
    }
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, 0), child);
    if (WIFEXITED(status) && WEXITSTATUS(status) == 2) {
        GTEST_SKIP() << "this environment does not let root change its root directory";
    }
    EXPECT_EQ(status, 0);
}

} // namespace qelo::nodes::tests
