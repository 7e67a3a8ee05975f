// What the sweep over system calls judges by finds each fault that it is to find.
#include "HalfDone.h"
#include "WatchedCommands.h"

#include "platform/commands/CommandTest.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

const std::string kKind = "100644 0:0\n";
const std::string kRoot = "root:x:0:0:root:/root:/bin/bash\n";
const std::string kZoe = "zoe:x:1000:1000::/home/zoe:/bin/bash\n";
const std::string kOldAlice = "alice:x:1001:1001:A:/home/alice:/bin/bash\n";
const std::string kNewAlice = "alice:x:1001:1001:Alice:/home/alice:/bin/bash\n";

// All account files empty but passwd.
RootState stateWith(const std::string& passwd) {
    RootState state;
    for (const char* file : {"passwd", "shadow", "group", "gshadow", "subuid", "subgid"}) {
        state[std::string("etc/") + file] = kKind;
    }
    state["etc/passwd"] += passwd;
    return state;
}

// After a command that changes alice's entry was cut off.
std::vector<std::string> lossesOf(const RootState& now) {
    return findLosses(now, stateWith(kRoot + kOldAlice + kZoe),
                      stateWith(kRoot + kNewAlice + kZoe));
}

TEST(HalfDone, Entries_of_the_command_may_be_old_or_new) {
    EXPECT_THAT(lossesOf(stateWith(kRoot + kOldAlice + kZoe)), IsEmpty());
    EXPECT_THAT(lossesOf(stateWith(kRoot + kNewAlice + kZoe)), IsEmpty());
    EXPECT_THAT(findLosses(stateWith(kRoot), stateWith(kRoot), stateWith(kRoot + kZoe)), IsEmpty());
    EXPECT_THAT(findLosses(stateWith(kRoot), stateWith(kRoot + kZoe), stateWith(kRoot)), IsEmpty());
}

TEST(HalfDone, A_file_that_is_missing_or_empty_is_found) {
    RootState now = stateWith(kRoot + kOldAlice + kZoe);
    now.erase("etc/subgid");
    EXPECT_THAT(lossesOf(now), ElementsAre("no file subgid"));
    EXPECT_EQ(5u, lossesOf(stateWith("")).size());
}

TEST(HalfDone, A_line_that_is_lost_or_changed_or_there_twice_is_found) {
    EXPECT_THAT(lossesOf(stateWith(kRoot + kNewAlice)),
                UnorderedElementsAre("passwd: not there once: " + kZoe.substr(0, kZoe.size() - 1),
                                     "passwd: gone: zoe"));
    EXPECT_EQ(
        1u,
        lossesOf(stateWith(kRoot + kNewAlice + "zoe:x:1000:1000::/home/zoe:/bin/false\n")).size());
    EXPECT_EQ(2u, lossesOf(stateWith(kRoot + kNewAlice + kZoe + kZoe)).size());
    EXPECT_THAT(lossesOf(stateWith(kRoot + kZoe)), ElementsAre("passwd: gone: alice"));
    EXPECT_THAT(lossesOf(stateWith(kRoot + kNewAlice + kZoe + "m:x:1:1:::\n")),
                ElementsAre("passwd: of neither state: m"));
}

TEST(HalfDone, A_line_that_is_not_whole_is_found) {
    EXPECT_THAT(lossesOf(stateWith(kRoot + kZoe + kNewAlice.substr(0, 20))),
                UnorderedElementsAre("passwd: no newline at the end",
                                     "passwd: malformed: " + kNewAlice.substr(0, 20)));
}

TEST(HalfDone, Another_mode_or_owner_is_found) {
    RootState now = stateWith(kRoot + kOldAlice + kZoe);
    now["etc/shadow"] = "100644 1000:0\n";
    EXPECT_THAT(lossesOf(now), ElementsAre("shadow: another mode or owner: 100644 1000:0"));
}

TEST(HalfDone, Locks_and_drafts_are_found) {
    const ScratchDirectory scratch;
    std::filesystem::create_directory(scratch.path() / "etc");
    for (const char* name : {"passwd", "passwd-", "login.defs", ".qelosim.lock"}) {
        write(scratch.path() / "etc" / name, "");
    }
    EXPECT_THAT(findRests(scratch.path()), IsEmpty());
    for (const char* name : {"passwd.lock", "group.12", "shadow+", ".shadow.qelosim"}) {
        write(scratch.path() / "etc" / name, "");
    }
    EXPECT_THAT(findRests(scratch.path()),
                UnorderedElementsAre("passwd.lock", "group.12", "shadow+", ".shadow.qelosim"));
}

TEST(HalfDone, A_report_of_a_sanitizer_is_found) {
    EXPECT_TRUE(isSane({1, "qelosim: refused", "", 0}));
    EXPECT_FALSE(isSane({199, "", "", 0}));
    EXPECT_FALSE(isSane({1, "==7==ERROR: AddressSanitizer: heap-use-after-free", "", 0}));
    EXPECT_FALSE(isSane({1, "a.cpp:1:2: runtime error: signed integer overflow", "", 0}));
}

} // namespace
} // namespace qelo::test
