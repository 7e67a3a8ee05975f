// Making a root directory to try commands on.
#include "ScratchRoot.h"
#include "CommandTest.h"

#include <sys/stat.h>
#include <unistd.h>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

unsigned modeOf(const fs::path& path) {
    struct stat status {};
    EXPECT_EQ(0, ::stat(path.c_str(), &status)) << path;
    return status.st_mode & 07777u;
}

} // namespace

TEST(ScratchRoot, Is_complete_and_sound) {
    const ScratchDirectory scratch;
    const fs::path root = scratch.path() / "a/b/root";
    const store::CommandOutcome made = store::initRoot(root);
    ASSERT_TRUE(made.accepted) << made.status;
    EXPECT_THAT(findFaults(root), testing::IsEmpty());
    EXPECT_EQ("0", lineOf(root / "etc/passwd", "root").at(2));
    EXPECT_EQ("65534", lineOf(root / "etc/passwd", "nobody").at(2));
    EXPECT_EQ("*", lineOf(root / "etc/shadow", "root").at(1));
}

TEST(ScratchRoot, Has_the_right_modes_whatever_the_umask) {
    for (const mode_t mask : {0022u, 0077u, 0000u}) {
        const ScratchDirectory scratch;
        const mode_t before = ::umask(mask);
        EXPECT_TRUE(store::initRoot(scratch.path()).accepted);
        ::umask(before);
        for (const char* name : {"etc/passwd", "etc/group", "etc/login.defs", "etc/default/useradd",
                                 "etc/skel/.profile", "etc/subuid", "etc/subgid"}) {
            EXPECT_EQ(0644u, modeOf(scratch.path() / name)) << name;
        }
        for (const char* name : {"etc", "etc/default", "etc/skel", "home"}) {
            EXPECT_EQ(0755u, modeOf(scratch.path() / name)) << name;
        }
        EXPECT_EQ(0640u, modeOf(scratch.path() / "etc/shadow"));
        EXPECT_EQ(0640u, modeOf(scratch.path() / "etc/gshadow"));
    }
}

TEST(ScratchRoot, Keeps_what_is_there) {
    const ScratchDirectory scratch;
    fs::create_directories(scratch.path() / "etc");
    fs::create_directories(scratch.path() / "home/alice");
    EXPECT_TRUE(store::initRoot(scratch.path()).accepted);
    EXPECT_TRUE(fs::exists(scratch.path() / "home/alice"));
    const auto before = stateOf(scratch.path());
    const store::CommandOutcome again = store::initRoot(scratch.path());
    EXPECT_FALSE(again.accepted);
    EXPECT_FALSE(again.status.empty());
    EXPECT_EQ(before, stateOf(scratch.path()));
}

TEST(ScratchRoot, Is_made_where_an_earlier_command_was_killed) {
    const ScratchDirectory scratch;
    fs::create_directories(scratch.path() / ".etc.qelosim/skel");
    write(scratch.path() / ".etc.qelosim/passwd", "root:x:");
    const store::CommandOutcome made = store::initRoot(scratch.path());
    EXPECT_TRUE(made.accepted) << made.status;
    EXPECT_FALSE(fs::exists(scratch.path() / ".etc.qelosim"));
    EXPECT_THAT(findFaults(scratch.path()), testing::IsEmpty());
}

TEST(ScratchRoot, Is_refused_where_an_etc_holds_anything_or_leads_elsewhere) {
    const ScratchDirectory scratch;
    const ScratchDirectory elsewhere;
    fs::create_directory(scratch.path() / "etc");
    write(scratch.path() / "etc/motd", "hello");
    EXPECT_FALSE(store::initRoot(scratch.path()).accepted);
    fs::remove_all(scratch.path() / "etc");
    fs::create_directory_symlink(elsewhere.path(), scratch.path() / "etc");
    EXPECT_FALSE(store::initRoot(scratch.path()).accepted);
    EXPECT_TRUE(fs::is_empty(elsewhere.path()));
    fs::remove(scratch.path() / "etc");
    write(scratch.path() / "etc", "a file");
    EXPECT_FALSE(store::initRoot(scratch.path()).accepted);
    EXPECT_FALSE(store::initRoot("/").accepted);
    EXPECT_FALSE(store::initRoot("").accepted);
    EXPECT_FALSE(store::initRoot(scratch.path() / "etc/below").accepted);
}

} // namespace qelo::test
