#include "Files.h"

#include "ScratchRoot.h"

#include <gmock/gmock.h>

#include <cerrno>
#include <sys/stat.h>
#include <unistd.h>

namespace qelo::nodes::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr std::size_t limit = 1'000'000;

FileContent readFrom(const std::filesystem::path& path) {
    return systemFiles().read(path.string(), limit);
}

} // namespace

TEST(SystemFiles, The_whole_content_is_read_with_its_stamp) {
    const ScratchRoot root;
    for (const std::size_t size : {0UL, 1UL, 4096UL, 65537UL, limit}) {
        const auto path = root.write("file", std::string(size, 'x'));
        const FileContent content = readFrom(path);
        EXPECT_EQ(content.error, 0);
        EXPECT_EQ(content.bytes.size(), size);
        EXPECT_EQ(content.stamp, systemFiles().stamp(path.string()));
    }
}

TEST(SystemFiles, A_file_above_the_limit_is_not_read) {
    const ScratchRoot root;
    const FileContent content = readFrom(root.write("file", std::string(limit + 1, 'x')));
    EXPECT_EQ(content.error, EFBIG);
    EXPECT_TRUE(content.bytes.empty());
}

TEST(SystemFiles, A_file_whose_size_is_not_told_beforehand_is_read_whole) {
    const FileContent content = systemFiles().read("/proc/self/status", limit);
    EXPECT_EQ(content.error, 0);
    EXPECT_EQ(content.bytes.compare(0, 5, "Name:"), 0);
    EXPECT_EQ(content.bytes.back(), '\n');
}

TEST(SystemFiles, A_file_that_turns_out_larger_than_the_limit_is_not_read) {
    const FileContent content = systemFiles().read("/proc/self/status", 10);
    EXPECT_EQ(content.error, EFBIG);
    EXPECT_TRUE(content.bytes.empty());
}

TEST(SystemFiles, What_is_no_regular_file_is_not_read) {
    const ScratchRoot root;
    const auto fifo = root.path() / "fifo";
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    EXPECT_EQ(readFrom(fifo).error, EINVAL);
    EXPECT_EQ(readFrom(root.path()).error, EINVAL);
    EXPECT_EQ(readFrom("/dev/zero").error, EINVAL);
}

TEST(SystemFiles, A_missing_file_has_its_error_in_content_and_stamp) {
    const ScratchRoot root;
    EXPECT_EQ(readFrom(root.path() / "none").error, ENOENT);
    EXPECT_EQ(readFrom(root.path() / "none").stamp.error, ENOENT);
    std::filesystem::create_symlink("loop", root.path() / "loop");
    EXPECT_EQ(readFrom(root.path() / "loop").error, ELOOP);
}

TEST(SystemFiles, A_file_without_permission_keeps_its_stamp) {
    if (::geteuid() == 0) {
        GTEST_SKIP() << "root may read every file";
    }
    const ScratchRoot root;
    const auto path = root.write("file", "x");
    std::filesystem::permissions(path, std::filesystem::perms::none);
    const FileContent content = readFrom(path);
    EXPECT_EQ(content.error, EACCES);
    EXPECT_EQ(content.stamp, systemFiles().stamp(path.string()));
    EXPECT_EQ(content.stamp.error, 0);
}

TEST(SystemFiles, Every_kind_of_change_changes_the_stamp) {
    const ScratchRoot root;
    const auto path = root.write("file", "one");
    FileStamp last = systemFiles().stamp(path.string());
    const auto expectChanged = [&](const char* what) {
        const FileStamp stamp = systemFiles().stamp(path.string());
        EXPECT_NE(stamp, last) << what;
        last = stamp;
        ::usleep(30'000); // longer than a tick of the kernel's file clock
    };
    ::usleep(30'000);
    root.write("file", "two");
    expectChanged("rewritten with the same size");
    root.append("file", "more");
    expectChanged("appended");
    root.replace("file", "twomore");
    expectChanged("replaced");
    std::filesystem::permissions(path, std::filesystem::perms::owner_read);
    expectChanged("permissions");
    std::filesystem::remove(path);
    expectChanged("removed");
}

TEST(SystemFiles, Names_of_a_directory_come_in_byte_order) {
    const ScratchRoot root;
    root.write("d/b", "");
    root.write("d/a", "");
    EXPECT_THAT(systemFiles().list((root.path() / "d").string()), ElementsAre(".", "..", "a", "b"));
    EXPECT_THAT(systemFiles().list((root.path() / "none").string()), IsEmpty());
}

TEST(Wipe, Overwrites_before_it_empties) {
    std::string text(100, 's');
    const char* bytes = text.data();
    wipe(text);
    EXPECT_TRUE(text.empty());
    text.reserve(100);
    EXPECT_EQ(text.data(), bytes);
    EXPECT_EQ(bytes[1], '\0');
}

} // namespace qelo::nodes::tests
