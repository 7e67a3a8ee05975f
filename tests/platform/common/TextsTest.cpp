#include "platform/TeskCommon.h"

#include <gtest/gtest.h>

#include <array>
#include <optional>
#include <string>

#include <sched.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using Tesk::getSystemName;
using Tesk::make_string;

TEST(SystemName, Is_the_name_the_kernel_goes_by) {
    std::array<char, 256> name{};
    ASSERT_EQ(::gethostname(name.data(), name.size() - 1), 0);
    EXPECT_EQ(getSystemName(), name.data());
}

// What getSystemName gives in a child whose kernel calls the host `kernelName`, so that this
// machine keeps its name; nothing where processes can have no host names of their own.
std::optional<std::string> systemNameWhere(const std::string& kernelName) {
    std::array<int, 2> ends{};
    if (::pipe(ends.data()) != 0) {
        return std::nullopt;
    }
    const pid_t child = ::fork();
    if (child == 0) {
        const bool apart =
            ::unshare(CLONE_NEWUTS) == 0 || ::unshare(CLONE_NEWUSER | CLONE_NEWUTS) == 0;
        const bool named = apart && ::sethostname(kernelName.data(), kernelName.size()) == 0;
        const std::string name = named ? getSystemName() : "";
        const auto written = ::write(ends[1], name.data(), name.size());
        ::_exit(named && written >= 0 ? 0 : 1);
    }
    ::close(ends[1]);
    std::array<char, 256> name{};
    const ssize_t size = ::read(ends[0], name.data(), name.size());
    ::close(ends[0]);
    int status = 1;
    ::waitpid(child, &status, 0);
    return status == 0 ? std::optional<std::string>({name.data(), static_cast<std::size_t>(size)})
                       : std::nullopt;
}

TEST(SystemName, Is_localhost_where_the_kernel_has_none) {
    if (!systemNameWhere("probe")) {
        GTEST_SKIP() << "processes cannot have host names of their own here";
    }
    EXPECT_EQ(systemNameWhere(""), "localhost");
    EXPECT_EQ(systemNameWhere("(none)"), "localhost");
}

TEST(SystemName, Is_the_full_name_where_the_kernel_has_it) {
    const std::string name = "server." + std::string(50, 'x') + ".org";
    if (!systemNameWhere("probe")) {
        GTEST_SKIP() << "processes cannot have host names of their own here";
    }
    EXPECT_EQ(systemNameWhere(name), name);
}

TEST(MakeString, Ascii_stays_as_it_is) {
    EXPECT_EQ(make_string(L""), "");
    EXPECT_EQ(make_string(L"Simple Identity"), "Simple Identity");
    EXPECT_EQ(make_string(std::wstring(L"a\0b", 3)), std::string("a\0b", 3));
}

TEST(MakeString, Characters_of_every_length_are_encoded) {
    EXPECT_EQ(make_string(L"\x7f\x80\x7ff"), "\x7f\xc2\x80\xdf\xbf");
    EXPECT_EQ(make_string(L"\x800\xd7ff\xe000\xffff"),
              "\xe0\xa0\x80\xed\x9f\xbf\xee\x80\x80\xef\xbf\xbf");
    EXPECT_EQ(make_string(L"\x10000\x10ffff"), "\xf0\x90\x80\x80\xf4\x8f\xbf\xbf");
    EXPECT_EQ(make_string(L"\u7c21\u6613"), "\u7c21\u6613");
}

TEST(MakeString, What_is_no_character_becomes_the_replacement_character) {
    const std::wstring odd = {static_cast<wchar_t>(0xD800), static_cast<wchar_t>(0xDFFF),
                              static_cast<wchar_t>(0x110000), static_cast<wchar_t>(-1), L'x'};
    EXPECT_EQ(make_string(odd), "\ufffd\ufffd\ufffd\ufffdx");
}

} // namespace
