// Home directories: made, left alone, removed.
#include "CommandExecutor.h"
#include "CommandTest.h"
#include "PosixFileSystem.h"

#include <cerrno>
#include <fcntl.h>
#include <fstream>
#include <sys/stat.h>
#include <unistd.h>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

using testing::HasSubstr;

struct stat statusOf(const fs::path& path) {
    struct stat status {};
    EXPECT_EQ(0, ::lstat(path.c_str(), &status)) << path;
    return status;
}

// An ordinary user can only make home directories that are his own.
class Home : public CommandTest {
protected:
    Home() : uid_(isSuperuser() ? 4000 : ::getuid()), gid_(isSuperuser() ? 4000 : ::getgid()) {
        accept("CreateGroup", {text("Name", "own"), number("GroupId", gid_)});
    }

    std::vector<std::string> newUser(const std::string& name, const std::string& home) const {
        return {text("Name", name), number("UserID", uid_), number("GroupId", gid_),
                text("HomeDirectory", home), number("CreateHome", 1)};
    }

    // An account with a home directory that somebody else has made.
    void addUser(const std::string& name, const std::string& home) const {
        accept("CreateUser", {text("Name", name), number("UserID", uid_), number("GroupId", gid_),
                              text("HomeDirectory", home)});
    }

    fs::path makeOwned(const std::string& path) const {
        const fs::path directory = root() / path;
        fs::create_directories(directory);
        if (isSuperuser()) {
            EXPECT_EQ(0, ::chown(directory.c_str(), uid_, gid_));
        }
        return directory;
    }

    std::string refuseRemoval(const std::string& name) const {
        return refuse("DeleteUser", {text("Name", name), number("RemoveHome", 1)});
    }

    uid_t uid_;
    gid_t gid_;
};

} // namespace

TEST_F(Home, Is_made_from_the_roots_skeleton_and_given_to_the_user) {
    write(etc("skel/readme"), "hello\n");
    fs::create_directories(etc("skel/.config/app"));
    write(etc("skel/.config/app/rc"), "x=1\n");
    ::chmod(etc("skel/.config/app/rc").c_str(), 0640);
    fs::create_symlink("readme", etc("skel/link"));
    accept("CreateUser", newUser("alice", "/home/alice"));
    const fs::path home = root() / "home/alice";
    EXPECT_EQ(0700u, statusOf(home).st_mode & 07777u);
    EXPECT_EQ("hello\n", contentOf(home / "readme"));
    EXPECT_EQ("x=1\n", contentOf(home / ".config/app/rc"));
    EXPECT_EQ(0640u, statusOf(home / ".config/app/rc").st_mode & 07777u);
    EXPECT_EQ("readme", fs::read_symlink(home / "link"));
    EXPECT_TRUE(fs::exists(home / ".profile"));
    for (const char* name : {"", "readme", ".config", ".config/app/rc", "link"}) {
        EXPECT_EQ(uid_, statusOf(home / name).st_uid) << name;
        EXPECT_EQ(gid_, statusOf(home / name).st_gid) << name;
    }
    EXPECT_EQ(1, std::distance(fs::directory_iterator(root() / "home"), fs::directory_iterator()));
}

TEST_F(Home, Follows_the_settings_of_the_root) {
    write(etc("login.defs"), "UMASK 027\n# HOME_MODE 0700\nCREATE_HOME yes\nUSERGROUPS_ENAB yes\n");
    write(etc("default/useradd"), "HOME=/people\nSKEL=/etc/other\nSHELL=/bin/sh\n");
    fs::create_directory(etc("other"));
    write(etc("other/first"), "1");
    accept("CreateUser", {text("Name", "alice"), number("UserID", uid_), number("GroupId", gid_)});
    EXPECT_EQ(0750u, statusOf(root() / "people/alice").st_mode & 07777u);
    EXPECT_EQ("1", contentOf(root() / "people/alice/first"));
    EXPECT_EQ(0755u, statusOf(root() / "people").st_mode & 07777u);
    EXPECT_EQ(::geteuid(), statusOf(root() / "people").st_uid);
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
    accept("CreateUser", {text("Name", "alice"), number("UserID", uid_), number("GroupId", gid_),
                          number("CreateHome", 0)});
    EXPECT_FALSE(fs::exists(root() / "people/alice"));
    fs::remove_all(etc("other"));
}

TEST_F(Home, Settings_without_a_value_are_none) {
    write(etc("login.defs"), "HOME_MODE \r\nUMASK=\r\nHOME_MODE\r\nMAIL_DIR \r\n");
    write(etc("default/useradd"), "SKEL= \r\n");
    accept("CreateUser", newUser("alice", "/home/alice"));
    EXPECT_EQ(0755u, statusOf(root() / "home/alice").st_mode & 07777u);
    EXPECT_TRUE(fs::exists(root() / "home/alice/.profile")); // of the usual skeleton
}

TEST_F(Home, That_is_the_users_already_is_left_as_it_is) {
    write(makeOwned("home/alice") / "diary", "old");
    accept("CreateUser", newUser("alice", "/home/alice"));
    EXPECT_EQ("old", contentOf(root() / "home/alice/diary"));
    EXPECT_FALSE(fs::exists(root() / "home/alice/.profile"));
}

TEST_F(Home, That_is_somebody_elses_refuses_the_user) {
    write(root() / "home/file", "");
    fs::create_symlink("/tmp", root() / "home/link");
    EXPECT_THAT(refuse("CreateUser", newUser("alice", "/home/file")), HasSubstr("does not belong"));
    EXPECT_THAT(refuse("CreateUser", newUser("alice", "/home/link")), HasSubstr("does not belong"));
    if (isSuperuser()) {
        fs::create_directory(root() / "home/roots");
        refuse("CreateUser", newUser("alice", "/home/roots"));
    }
}

TEST_F(Home, Is_never_made_outside_the_root) {
    const ScratchDirectory outside;
    fs::remove(root() / "home");
    fs::create_symlink(outside.path(), root() / "home");
    accept("CreateUser", newUser("alice", "/home/alice"));
    EXPECT_TRUE(fs::is_empty(outside.path()));
    // The link leads to the same path within the root.
    EXPECT_TRUE(fs::exists(root() / outside.path().relative_path() / "alice/.profile"));
}

TEST_F(Home, Links_on_the_way_are_followed_within_the_root) {
    fs::create_directories(root() / "data/a/b");
    fs::create_symlink("../../../../../../data/a/b", root() / "people");
    accept("CreateUser", newUser("alice", "/people/alice"));
    EXPECT_TRUE(fs::exists(root() / "data/a/b/alice/.profile"));
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
    EXPECT_TRUE(fs::is_empty(root() / "data/a/b"));
    fs::create_symlink("loop", root() / "loop");
    EXPECT_FALSE(run("CreateUser", {text("Name", "bob"), text("HomeDirectory", "/loop/bob"),
                                    number("CreateHome", 1)})
                     .accepted);
    EXPECT_TRUE(passwd("bob").empty());
}

TEST_F(Home, Is_not_made_in_a_directory_of_another_user) {
    if (!isSuperuser()) {
        GTEST_SKIP() << "only the superuser can give a directory away";
    }
    fs::create_directory(root() / "home/mallory");
    ASSERT_EQ(0, ::chown((root() / "home/mallory").c_str(), 4001, 4001));
    EXPECT_THAT(refuse("CreateUser", newUser("alice", "/home/mallory/alice")),
                HasSubstr("other users"));
    fs::create_symlink("/etc", root() / "home/mallory/link");
    ASSERT_EQ(0, ::lchown((root() / "home/mallory/link").c_str(), 4001, 4001));
    EXPECT_THAT(refuse("CreateUser", newUser("alice", "/home/mallory/link/alice")),
                HasSubstr("symbolic link"));
}

TEST_F(Home, Is_not_made_where_everybody_may_write) {
    fs::create_directory(root() / "open");
    ::chmod((root() / "open").c_str(), 0777);
    EXPECT_THAT(refuse("CreateUser", newUser("alice", "/open/alice")), HasSubstr("other users"));
    ::chmod((root() / "open").c_str(), 01777);
    accept("CreateUser", newUser("alice", "/open/alice"));
}

TEST_F(Home, Directories_made_on_the_way_go_when_the_user_cannot_be_made) {
    fs::create_directory(etc("skel/sub"));
    // More levels than a skeleton may have.
    fs::path deep = etc("skel/sub");
    for (int i = 0; i < 40; ++i) {
        deep /= "d";
        fs::create_directory(deep);
    }
    EXPECT_THAT(refuse("CreateUser", newUser("alice", "/a/b/c/alice")), HasSubstr("skeleton"));
    EXPECT_FALSE(fs::exists(root() / "a"));
}

TEST_F(Home, An_ordinary_user_cannot_make_one_for_somebody_else) {
    if (isSuperuser()) {
        GTEST_SKIP() << "the superuser can";
    }
    EXPECT_THAT(refuse("CreateUser", {text("Name", "alice"), number("CreateHome", 1)}),
                testing::AnyOf(HasSubstr("skeleton"), HasSubstr("cannot be given")));
}

TEST_F(Home, A_new_one_is_made_for_an_existing_user_and_the_old_one_stays) {
    accept("CreateUser", newUser("alice", "/home/alice"));
    write(root() / "home/alice/diary", "old");
    accept("ModifyUser",
           {text("Name", "alice"), text("HomeDirectory", "/home/new"), number("CreateHome", 1)});
    EXPECT_EQ("old", contentOf(root() / "home/alice/diary"));
    EXPECT_TRUE(fs::exists(root() / "home/new/.profile"));
    EXPECT_FALSE(fs::exists(root() / "home/new/diary"));
    accept("ModifyUser", {text("Name", "alice"), text("HomeDirectory", "/home/none")});
    EXPECT_FALSE(fs::exists(root() / "home/none"));
}

TEST_F(Home, Follows_the_user_to_a_new_number) {
    if (!isSuperuser()) {
        GTEST_SKIP() << "only the superuser can give files away";
    }
    accept("CreateUser", newUser("alice", "/home/alice"));
    const fs::path home = root() / "home/alice";
    fs::create_directories(home / "a/b");
    write(home / "a/b/file", "");
    write(home / "foreign", "");
    fs::create_symlink("/etc/passwd", home / "link");
    for (const char* name : {"a", "a/b", "a/b/file", "link"}) {
        ASSERT_EQ(0, ::lchown((home / name).c_str(), uid_, gid_));
    }
    accept("ModifyUser", {text("Name", "alice"), number("UserID", 4444), number("GroupId", 100)});
    for (const char* name : {"", "a", "a/b", "a/b/file", "link", ".profile"}) {
        EXPECT_EQ(4444u, statusOf(home / name).st_uid) << name;
        EXPECT_EQ(100u, statusOf(home / name).st_gid) << name;
    }
    EXPECT_EQ(0u, statusOf(home / "foreign").st_uid);
    EXPECT_EQ(0u, statusOf(etc("passwd")).st_uid);
}

TEST_F(Home, Belongs_to_the_same_numbers_again_when_a_later_step_fails) {
    if (!isSuperuser()) {
        GTEST_SKIP() << "only the superuser can give files away";
    }
    class WithoutShadow : public store::PosixFileSystem {
    public:
        bool rename(int fromDirectory, const std::string& from, int toDirectory,
                    const std::string& to) override {
            errno = EIO;
            return to != "shadow" && PosixFileSystem::rename(fromDirectory, from, toDirectory, to);
        }
    };
    accept("CreateUser", newUser("alice", "/home/alice"));
    const fs::path home = root() / "home/alice";
    // Files that belong to the new numbers already.
    write(home / "user", "");
    write(home / "group", "");
    ASSERT_EQ(0, ::lchown((home / "user").c_str(), 4444, gid_));
    ASSERT_EQ(0, ::lchown((home / "group").c_str(), uid_, 100));
    const auto before = stateOf(root());
    WithoutShadow files;
    const auto status = store::executeCommand(
        root(),
        command("ModifyUser", {text("Name", "alice"), number("UserID", 4444),
                               number("GroupId", 100), number("daysExpireAfter", 3)}),
        files, store::systemTools());
    EXPECT_FALSE(status);
    EXPECT_EQ(before, stateOf(root()));
}

TEST_F(Home, Stays_unless_its_removal_is_asked_for) {
    accept("CreateUser", newUser("alice", "/home/alice"));
    accept("DeleteUser", {text("Name", "alice")});
    EXPECT_TRUE(fs::exists(root() / "home/alice/.profile"));
    accept("CreateUser", newUser("alice", "/home/alice"));
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 0)});
    EXPECT_TRUE(fs::exists(root() / "home/alice/.profile"));
}

TEST_F(Home, Is_removed_with_all_that_is_in_it_and_nothing_else) {
    accept("CreateUser", newUser("alice", "/home/alice"));
    const fs::path home = root() / "home/alice";
    fs::create_directories(root() / "keep/sub");
    write(root() / "keep/sub/file", "keep");
    fs::create_directory_symlink("../../keep", home / "relative");
    fs::create_directory_symlink(root() / "keep", home / "absolute");
    fs::create_hard_link(root() / "keep/sub/file", home / "hard");
    fs::create_directories(home / "x/y/z");
    ASSERT_EQ(0, ::mkfifo((home / "x/pipe").c_str(), 0600));
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
    EXPECT_TRUE(fs::is_empty(root() / "home"));
    EXPECT_EQ("keep", contentOf(root() / "keep/sub/file"));
}

TEST_F(Home, Of_any_depth_is_removed) {
    accept("CreateUser", newUser("alice", "/home/alice"));
    int directory = ::open((root() / "home/alice").c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    for (int i = 0; i < 3000; ++i) {
        ASSERT_EQ(0, ::mkdirat(directory, "deep", 0700));
        const int next = ::openat(directory, "deep", O_RDONLY | O_DIRECTORY | O_CLOEXEC);
        ASSERT_GE(next, 0);
        ::close(directory);
        directory = next;
    }
    ::close(directory);
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
    EXPECT_TRUE(fs::is_empty(root() / "home"));
}

TEST_F(Home, That_is_not_there_is_no_obstacle) {
    accept("CreateUser", {text("Name", "alice"), text("HomeDirectory", "/nowhere/at/all")});
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
    EXPECT_TRUE(passwd("alice").empty());
}

TEST_F(Home, Of_another_owner_is_not_removed) {
    addUser("alice", "/home/alice");
    fs::create_symlink("/home", root() / "home/alice");
    EXPECT_THAT(refuseRemoval("alice"), HasSubstr("does not belong"));
    fs::remove(root() / "home/alice");
    write(root() / "home/alice", "file");
    EXPECT_THAT(refuseRemoval("alice"), HasSubstr("does not belong"));
    fs::remove(root() / "home/alice");
    if (isSuperuser()) {
        fs::create_directory(root() / "home/alice");
        EXPECT_THAT(refuseRemoval("alice"), HasSubstr("does not belong"));
    }
}

TEST_F(Home, Directories_of_the_system_are_not_removed) {
    for (const char* path : {"/home", "/srv", "/etc/skel", "/usr/games/x", "/var/lib", "/var/mail",
                             "/bin/x/y", "/dev/shm/x", "/proc/1", "/run/user/1"}) {
        makeOwned(std::string(path).substr(1));
        addUser("alice", path);
        EXPECT_THAT(refuseRemoval("alice"), HasSubstr("of the system")) << path;
        accept("DeleteUser", {text("Name", "alice")});
    }
}

TEST_F(Home, That_is_the_root_itself_is_not_removed) {
    addUser("alice", "/home/alice");
    for (const char* path : {"/", "//", "/.", "/..", "/../.."}) {
        std::string content = contentOf(etc("passwd"));
        const std::string before = content;
        content.replace(content.find("/home/alice"), 11, path);
        write(etc("passwd"), content);
        refuseRemoval("alice");
        accept("ModifyUser", {text("Name", "alice"), text("FullName", "x")});
        write(etc("passwd"), before);
    }
}

TEST_F(Home, That_is_no_directory_does_not_keep_a_user_from_a_new_number) {
    for (const char* path : {"/etc/passwd", "/etc/passwd/x", "/nowhere/x", "/nowhere"}) {
        addUser("alice", path);
        const std::string before = contentOf(etc("group"));
        accept("ModifyUser", {text("Name", "alice"), number("UserID", 4711)});
        EXPECT_EQ(before, contentOf(etc("group")));
        accept("DeleteUser", {text("Name", "alice")});
    }
}

TEST_F(Home, That_another_account_lives_in_is_not_removed) {
    makeOwned("home/alice/sub");
    makeOwned("home/alice");
    fs::create_symlink("/home/alice/sub", root() / "home/way");
    addUser("alice", "/home/alice");
    for (const char* home : {"/home/alice", "/home/alice/", "//home//alice", "/home/alice/sub",
                             "/home/alice/none", "/home/way", "/home/../home/alice"}) {
        const std::string passwdBefore = contentOf(etc("passwd"));
        write(etc("passwd"), passwdBefore + "guest:x:950:100::" + home + ":/bin/sh\n");
        EXPECT_THAT(refuseRemoval("alice"), HasSubstr("another account")) << home;
        write(etc("passwd"), passwdBefore);
    }
    const std::string passwdBefore = contentOf(etc("passwd"));
    write(etc("passwd"), passwdBefore + "guest:x:950:100::/home/alice2:/bin/sh\n");
    write(etc("shadow"), contentOf(etc("shadow")) + "guest:*:19000::::::\n");
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
}

TEST_F(Home, Above_the_root_cannot_be_reached) {
    const ScratchDirectory outside;
    fs::create_directory(outside.path() / "victim");
    if (isSuperuser()) {
        ASSERT_EQ(0, ::chown((outside.path() / "victim").c_str(), uid_, gid_));
    }
    addUser("alice", "/home/alice");
    const std::string up = "/home/../../../../../../.." + (outside.path() / "victim").native();
    std::string content = contentOf(etc("passwd"));
    content.replace(content.find("/home/alice"), 11, up);
    write(etc("passwd"), content);
    accept("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)});
    EXPECT_TRUE(fs::exists(outside.path() / "victim"));
}

TEST_F(Home, That_is_exchanged_while_it_is_looked_at_is_not_removed) {
    // Another directory of the same owner, as whoever may write to the parent could put there.
    class Exchanging : public store::PosixFileSystem {
    public:
        explicit Exchanging(fs::path home) : home_(std::move(home)) {}
        bool rename(int fromDirectory, const std::string& from, int toDirectory,
                    const std::string& to) override {
            if (!exchanged_ && from == "alice") {
                exchanged_ = true;
                fs::rename(home_ / "alice", home_ / "hidden");
                fs::rename(home_ / "victim", home_ / "alice");
            }
            return PosixFileSystem::rename(fromDirectory, from, toDirectory, to);
        }

    private:
        fs::path home_;
        bool exchanged_ = false;
    };
    accept("CreateUser", newUser("alice", "/home/alice"));
    write(makeOwned("home/victim") / "file", "precious");
    Exchanging files(root() / "home");
    const auto status = store::executeCommand(
        root(), command("DeleteUser", {text("Name", "alice"), number("RemoveHome", 1)}), files,
        store::systemTools());
    ASSERT_FALSE(status);
    EXPECT_THAT(status.reason(), HasSubstr("exchanged"));
    EXPECT_EQ("precious", contentOf(root() / "home/alice/file"));
    EXPECT_FALSE(passwd("alice").empty());
}

} // namespace qelo::test
