// Who may log in, and what users may do.
#include <server/LoginCache.h>
#include <server/PasswordChecker.h>
#include <server/Permissions.h>

#include <gtest/gtest.h>

#include <crypt.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <string>
#include <sys/stat.h>
#include <unistd.h>

namespace {

using namespace std::chrono_literals;
using qelo::server::LoginCache;
using qelo::server::Permissions;
using qelo::server::userFileChecker;

std::string hashOf(const std::string& password) {
    crypt_data data = {};
    return crypt_r(password.c_str(), "$6$rounds=1000$abcdefgh", &data);
}

class UserFileTest : public testing::Test {
protected:
    void SetUp() override {
        char name[] = "/tmp/qelo-users-XXXXXX";
        const int descriptor = mkstemp(name);
        ASSERT_GE(descriptor, 0);
        close(descriptor);
        path_ = name;
    }
    void TearDown() override { (void)std::remove(path_.c_str()); }
    void write(const std::string& text) const { std::ofstream(path_) << text; }

    std::string problem() const {
        try {
            userFileChecker(path_);
            return "";
        } catch (const std::runtime_error& error) {
            return error.what();
        }
    }

    std::string path_;
};

TEST_F(UserFileTest, The_right_password_is_right_and_all_others_are_wrong) {
    write("# users\n\nada:" + hashOf("secret") + "\nbob:" + hashOf("other") + "\n");
    const auto checker = userFileChecker(path_);
    EXPECT_TRUE(checker->check("ada", "secret"));
    EXPECT_TRUE(checker->check("bob", "other"));
    EXPECT_FALSE(checker->check("ada", "other"));
    EXPECT_FALSE(checker->check("ada", ""));
    EXPECT_FALSE(checker->check("eve", "secret"));
    EXPECT_FALSE(checker->check("", ""));
    EXPECT_FALSE(checker->check("ada", std::string("secret\0x", 8)));
}

TEST_F(UserFileTest, A_change_of_the_file_counts_at_once) {
    write("ada:" + hashOf("old") + "\n");
    const auto checker = userFileChecker(path_);
    write("ada:" + hashOf("new") + "\n");
    EXPECT_FALSE(checker->check("ada", "old"));
    EXPECT_TRUE(checker->check("ada", "new"));
}

TEST_F(UserFileTest, A_file_that_is_damaged_later_lets_nobody_in) {
    write("ada:" + hashOf("secret") + "\n");
    const auto checker = userFileChecker(path_);
    write("ada:" + hashOf("secret") + "\ngarbage\n");
    EXPECT_FALSE(checker->check("ada", "secret"));
}

TEST_F(UserFileTest, A_damaged_line_is_named) {
    write("ada:" + hashOf("secret") + "\ngarbage\n");
    EXPECT_NE(problem().find(":2: user:hash is expected"), std::string::npos) << problem();
}

TEST_F(UserFileTest, A_password_in_clear_text_is_refused) {
    write("ada:secret\n");
    EXPECT_NE(problem().find(":1: not a hash"), std::string::npos) << problem();
}

TEST_F(UserFileTest, A_user_who_stands_there_twice_is_refused) {
    write("ada:" + hashOf("one") + "\nada:" + hashOf("two") + "\n");
    EXPECT_NE(problem().find(":2: a user who stands above"), std::string::npos) << problem();
}

TEST_F(UserFileTest, A_file_that_others_may_write_is_refused) {
    write("ada:" + hashOf("secret") + "\n");
    chmod(path_.c_str(), 0622);
    EXPECT_NE(problem().find("may be written by others"), std::string::npos) << problem();
}

TEST_F(UserFileTest, A_missing_file_is_named) {
    ASSERT_EQ(std::remove(path_.c_str()), 0);
    EXPECT_NE(problem().find("cannot read " + path_), std::string::npos) << problem();
}

TEST(LoginCache, Knows_exactly_what_it_was_told) {
    LoginCache cache(1h);
    EXPECT_FALSE(cache.knows("ada", "secret"));
    cache.remember("ada", "secret");
    EXPECT_TRUE(cache.knows("ada", "secret"));
    EXPECT_FALSE(cache.knows("ada", "Secret"));
    EXPECT_FALSE(cache.knows("ad", "asecret"));
    EXPECT_FALSE(cache.knows("bob", "secret"));
    EXPECT_TRUE(cache.knows("ada", "secret")) << "forgotten after a wrong password";
}

TEST(LoginCache, A_new_password_takes_the_place_of_the_old_one) {
    LoginCache cache(1h);
    cache.remember("ada", "old");
    cache.remember("ada", "new");
    EXPECT_FALSE(cache.knows("ada", "old"));
    EXPECT_TRUE(cache.knows("ada", "new"));
}

TEST(LoginCache, Forgets_in_time) {
    LoginCache cache(-1s);
    cache.remember("ada", "secret");
    EXPECT_FALSE(cache.knows("ada", "secret"));
}

TEST(LoginCache, Does_not_grow_without_end) {
    LoginCache cache(1h, 10);
    for (int i = 0; i < 25; ++i) {
        cache.remember("user" + std::to_string(i), "secret");
    }
    EXPECT_TRUE(cache.knows("user24", "secret"));
    EXPECT_FALSE(cache.knows("user0", "secret"));
}

TEST(Permissions, Root_may_change_things_and_nobody_else_without_a_group) {
    const Permissions permissions("");
    EXPECT_TRUE(permissions.mayChange("root"));
    EXPECT_FALSE(permissions.mayChange("nobody"));
    EXPECT_FALSE(permissions.mayChange(""));
    EXPECT_FALSE(permissions.mayChange("Root"));
}

TEST(Permissions, Members_of_the_group_may_too) {
    const Permissions permissions("nogroup"); // the primary group of nobody
    EXPECT_TRUE(permissions.mayChange("nobody"));
    EXPECT_FALSE(permissions.mayChange("daemon"));
    EXPECT_FALSE(permissions.mayChange("no-such-user-here"));
    EXPECT_FALSE(permissions.mayChange(""));
}

TEST(Permissions, A_group_that_does_not_exist_has_no_members) {
    const Permissions permissions("no-such-group-here");
    EXPECT_TRUE(permissions.mayChange("root"));
    EXPECT_FALSE(permissions.mayChange("nobody"));
}

} // namespace
