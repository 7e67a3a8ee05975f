// Checking a command's arguments against the table of methods.
#include "CimDay.h"
#include "CommandRequest.h"
#include "CommandTest.h"
#include "FieldRules.h"

namespace qelo::test {

namespace {

using store::dayOfDateTime;
using store::Method;
using store::parseCommandRequest;
using store::parseCommandText;

// The reason of the refusal, or "accepted".
std::string reasonFor(const std::string& line) {
    const auto parsed = parseCommandText(line);
    if (!parsed) {
        return "not parsed: " + parsed.reason();
    }
    const auto request = parseCommandRequest(*parsed);
    return request ? "accepted" : request.reason();
}

std::string reasonFor(const std::string& method, const std::vector<std::string>& arguments) {
    return reasonFor(command(method, arguments));
}

// A proper argument of every name.
std::map<std::string, std::string> allArguments() {
    return {{"Name", text("Name", "alice")},
            {"FullName", text("FullName", "A")},
            {"UserID", number("UserID", 1000)},
            {"GroupId", number("GroupId", 1000)},
            {"HomeDirectory", text("HomeDirectory", "/home/a")},
            {"ScriptPath", text("ScriptPath", "/bin/sh")},
            {"UserPassword", text("UserPassword", "pw")},
            {"CreateHome", number("CreateHome", 1)},
            {"RemoveHome", number("RemoveHome", 0)},
            {"Member", text("Member", "bob")},
            {"daysMustKeepPassword", number("daysMustKeepPassword", 1)},
            {"daysMustChangePasswordAfter", number("daysMustChangePasswordAfter", 1)},
            {"daysWarnBeforePasswordExpire", number("daysWarnBeforePasswordExpire", 1)},
            {"daysExpireAfter", number("daysExpireAfter", 1)},
            {"PasswordExpiration", dateTime("PasswordExpiration", "20300101000000.000000+000")}};
}

struct MethodRow {
    std::string name;
    std::vector<std::string> needed;
    std::vector<std::string> optional;
};

std::vector<MethodRow> allMethods() {
    const std::vector<std::string> account{"FullName",      "UserID",     "GroupId",
                                           "HomeDirectory", "ScriptPath", "UserPassword",
                                           "CreateHome"};
    std::vector<std::string> modify = account;
    modify.insert(modify.end(),
                  {"daysMustKeepPassword", "daysMustChangePasswordAfter",
                   "daysWarnBeforePasswordExpire", "daysExpireAfter", "PasswordExpiration"});
    return {{"CreateUser", {"Name"}, account},
            {"ModifyUser", {"Name"}, modify},
            {"DeleteUser", {"Name"}, {"RemoveHome"}},
            {"SetPassword", {"Name", "UserPassword"}, {}},
            {"EnableUser", {"Name"}, {}},
            {"DisableUser", {"Name"}, {}},
            {"CreateGroup", {"Name"}, {"GroupId"}},
            {"DeleteGroup", {"Name"}, {}},
            {"AddMember", {"Name", "Member"}, {}},
            {"RemoveMember", {"Name", "Member"}, {}}};
}

std::vector<std::string> valuesOf(const std::vector<std::string>& names) {
    std::vector<std::string> arguments;
    for (const std::string& name : names) {
        arguments.push_back(allArguments().at(name));
    }
    return arguments;
}

bool contains(const std::vector<std::string>& names, const std::string& name) {
    return std::find(names.begin(), names.end(), name) != names.end();
}

} // namespace

TEST(CommandRequest, Every_method_takes_its_arguments_and_no_others) {
    for (const MethodRow& method : allMethods()) {
        for (const auto& [name, argument] : allArguments()) {
            std::vector<std::string> arguments = valuesOf(method.needed);
            if (!contains(method.needed, name)) {
                arguments.push_back(argument);
            }
            const bool known = contains(method.needed, name) || contains(method.optional, name);
            EXPECT_EQ(known, reasonFor(method.name, arguments) == "accepted")
                << method.name << " " << name;
        }
    }
}

TEST(CommandRequest, Every_needed_argument_must_be_there) {
    for (const MethodRow& method : allMethods()) {
        for (std::size_t left = 0; left < method.needed.size(); ++left) {
            std::vector<std::string> arguments = valuesOf(method.needed);
            arguments.erase(arguments.begin() + static_cast<std::ptrdiff_t>(left));
            EXPECT_THAT(reasonFor(method.name, arguments), testing::HasSubstr("is missing"));
        }
    }
}

TEST(CommandRequest, Every_argument_is_taken_once_and_with_its_own_type_only) {
    for (const MethodRow& method : allMethods()) {
        std::vector<std::string> names = method.needed;
        names.insert(names.end(), method.optional.begin(), method.optional.end());
        for (const std::string& name : names) {
            std::vector<std::string> arguments = valuesOf(names);
            EXPECT_EQ("accepted", reasonFor(method.name, arguments));
            arguments.push_back(allArguments().at(name));
            EXPECT_EQ(method.name + ": " + name + " is given twice",
                      reasonFor(method.name, arguments));
            arguments.clear();
            for (const std::string& other : names) {
                arguments.push_back(other != name    ? allArguments().at(other)
                                    : name == "Name" ? number(name, 1)
                                                     : dateTime(name, "1"));
            }
            if (name == "PasswordExpiration") {
                arguments.back() = text(name, "20300101000000.000000+000");
            }
            EXPECT_EQ(method.name + ": " + name + " has the wrong type",
                      reasonFor(method.name, arguments));
        }
    }
}

TEST(CommandRequest, Names_of_methods_and_arguments_are_matched_exactly) {
    for (const char* method : {"createUser", "CREATEUSER", "CreateUsers", "CreateUse", "Reboot"}) {
        EXPECT_EQ("the method is unknown", reasonFor(method, {text("Name", "alice")}));
    }
    for (const char* name : {"name", "NAME", "Names", "Nam", "DaysExpireAfter"}) {
        EXPECT_THAT(reasonFor("ModifyUser", {text(name, "alice")}), testing::HasSubstr("none of"));
    }
}

TEST(CommandRequest, Every_value_arrives_in_its_field) {
    const std::string line =
        command("ModifyUser",
                {text("Name", "alice"), text("FullName", "Full"), number("UserID", 11),
                 number("GroupId", 12), text("HomeDirectory", "/h"), text("ScriptPath", "/s"),
                 text("UserPassword", "p:w"), number("CreateHome", 1),
                 number("daysMustKeepPassword", 13), number("daysMustChangePasswordAfter", 14),
                 number("daysWarnBeforePasswordExpire", 15), number("daysExpireAfter", 16),
                 dateTime("PasswordExpiration", "19700118000000.000000+000")});
    const auto parsed = parseCommandText(line);
    ASSERT_TRUE(parsed);
    const auto request = parseCommandRequest(*parsed);
    ASSERT_TRUE(request) << request.reason();
    EXPECT_EQ(Method::ModifyUser, request->method);
    EXPECT_EQ("alice", request->name);
    EXPECT_EQ("Full", request->fullName);
    EXPECT_EQ(11u, request->uid);
    EXPECT_EQ(12u, request->gid);
    EXPECT_EQ("/h", request->home);
    EXPECT_EQ("/s", request->shell);
    EXPECT_EQ("p:w", request->password->view());
    EXPECT_EQ(true, request->createHome);
    EXPECT_EQ(13u, request->ageing.minimum);
    EXPECT_EQ(14u, request->ageing.maximum);
    EXPECT_EQ(15u, request->ageing.warning);
    EXPECT_EQ(16u, request->ageing.inactive);
    EXPECT_EQ(17, request->ageing.expiry);
    EXPECT_FALSE(request->removeHome.has_value());
    EXPECT_FALSE(request->member.has_value());
}

TEST(CommandRequest, Negative_numbers_and_odd_forms_of_numbers_are_refused) {
    EXPECT_EQ("accepted",
              reasonFor("CreateUser", {text("Name", "a"), number("UserID", 2147483647)}));
    EXPECT_EQ("accepted", reasonFor("CreateUser", {text("Name", "a"), number("UserID", 0)}));
    for (const char* value :
         {"-1", "-2147483648", "2147483648", "4294967295", "4294967296", "", "+1", "01", "00", "1 ",
          " 1", "0x1", "1e3", "1.0", "one", "99999999999999999999"}) {
        EXPECT_EQ("CreateUser: UserID is not a number from 0 to 2147483647",
                  reasonFor("CreateUser",
                            {text("Name", "a"), std::string("UserID:CMPI_uint32:") + value}));
    }
}

TEST(CommandRequest, Flags_are_0_or_1) {
    for (const char* value : {"2", "-1", "", "true", "01", "10"}) {
        EXPECT_EQ("DeleteUser: RemoveHome is neither 0 nor 1",
                  reasonFor("DeleteUser",
                            {text("Name", "a"), std::string("RemoveHome:CMPI_uint32:") + value}));
    }
}

TEST(CommandRequest, A_refusal_never_quotes_a_value_or_an_unknown_argument) {
    const std::vector<std::string> lines{
        command("SetPassword",
                {text("Name", "alice"), text("UserPassword", "a"), "secret:CMPI_string:x"}),
        command("SetPassword", {text("Name", "alice"), number("UserPassword", 1), "secret"}),
        command("secret", {}),
        command("SetPassword", {text("Name", "sec:ret"), text("UserPassword", "secret")}),
        command("CreateUser", {text("Name", "alice"), text("FullName", "se:secret")})};
    for (const std::string& line : lines) {
        EXPECT_THAT(reasonFor(line),
                    testing::Not(testing::AnyOf("accepted", testing::HasSubstr("secret"))));
    }
}

TEST(NewNames, Follow_the_rule) {
    for (const char* name :
         {"a", "_", "_a", "a1", "a-b", "a_b", "a-", "abcdefghijklmnopqrstuvwxyz-0123"}) {
        EXPECT_FALSE(store::checkNewName(name)) << name;
    }
    for (const char* name : {"",       "A",        "1",         "-",
                             "-a",     "aB",       "a.b",       "a b",
                             "a$",     "a:b",      "a,b",       "a/b",
                             "../a",   "\xc3\xa9", "a\xc3\xa9", "abcdefghijklmnopqrstuvwxyz-01234",
                             "root\n", "a\t",      "--root",    "a=b"}) {
        EXPECT_TRUE(store::checkNewName(name)) << name;
    }
}

TEST(Paths, Are_absolute_and_have_no_odd_parts) {
    for (const char* path :
         {"/a", "/home/a", "/home/a b", "/home/\xc3\xa9", "/...", "/a/.b", "/-rf"}) {
        EXPECT_FALSE(store::checkPath(path)) << path;
    }
    for (const char* path : {"", "/", "//", "a", "home/a", "/a/", "/a//b", "/.", "/..", "/a/..",
                             "/a/../b", "/a/./b", "/a:b", "/a,b", "/a\nb", "/\xff", "~", "./a"}) {
        EXPECT_TRUE(store::checkPath(path)) << path;
    }
    EXPECT_FALSE(store::checkPath("/" + std::string(254, 'x')));
    EXPECT_TRUE(store::checkPath("/" + std::string(255, 'x')));
}

TEST(Texts, Are_UTF_8_without_control_characters) {
    for (const char* good : {"", "a", "\xc2\xa0", "\xdf\xbf", "\xe0\xa0\x80", "\xef\xbf\xbd",
                             "\xf0\x90\x80\x80", "\xf4\x8f\xbf\xbf", "-rf", "$(x)`y`|;&<>\"'\\"}) {
        EXPECT_FALSE(store::checkFullName(good)) << good;
    }
    for (const char* bad : {"\x01",
                            "\x1b[0m",
                            "\x7f",
                            "\xc2\x80",
                            "\xc2\x9b",
                            "\xc2",
                            "\xc0\x80",
                            "\xc1\xbf",
                            "\xe0\x9f\xbf",
                            "\xed\xa0\x80",
                            "\xf0\x8f\xbf\xbf",
                            "\xf4\x90\x80\x80",
                            "\xf5\x80\x80\x80",
                            "\x80",
                            "\xe2\x82",
                            "\xff",
                            "a\xf0\x90\x80",
                            "a:b",
                            "a,b",
                            "a\nb",
                            "a\rb"}) {
        EXPECT_TRUE(store::checkFullName(bad)) << bad;
    }
    EXPECT_FALSE(store::checkFullName(std::string(255, 'x')));
    EXPECT_TRUE(store::checkFullName(std::string(256, 'x')));
}

TEST(Days, Are_counted_in_UTC) {
    const std::map<std::string, long> days{
        {"19700101000000.000000+000", 0},      {"19700101235959.999999+000", 0},
        {"19700102000000.000000+000", 1},      {"20000301120000.000000+000", 11017},
        {"20300102000000.000000+000", 21916},  {"20300102003000.000000+060", 21915},
        {"20300102233000.000000-060", 21917},  {"20300102000000.******+000", 21916},
        {"19691231233000.000000-060", 0},      {"20240229000000.000000+000", 19782},
        {"99991231235959.999999+000", 2932896}};
    for (const auto& [text, day] : days) {
        const auto result = dayOfDateTime(text);
        ASSERT_TRUE(result) << text;
        EXPECT_EQ(day, *result) << text;
    }
}

TEST(Days, That_no_calendar_has_are_refused) {
    for (const char* text : {"",
                             "20300102",
                             "2030-01-02",
                             "20300102000000.000000+0000",
                             "20300102000000.000000+00",
                             "20300102000000.000000:000",
                             "00000042010203.000000:000",
                             "20301302000000.000000+000",
                             "20300002000000.000000+000",
                             "20300100000000.000000+000",
                             "20300132000000.000000+000",
                             "20300229000000.000000+000",
                             "21000229000000.000000+000",
                             "20300102240000.000000+000",
                             "20300102006000.000000+000",
                             "20300102000060.000000+000",
                             "19691231235959.000000+000",
                             "19700101000000.000000+060",
                             "2030010200000*.000000+000",
                             "********000000.000000+000",
                             "20300102000000.0000**+000",
                             "20300102000000,000000+000",
                             "2030010200000a.000000+000",
                             "-0300102000000.000000+000",
                             "20300102000000.000000+0x0",
                             " 0300102000000.000000+000"}) {
        EXPECT_FALSE(dayOfDateTime(text)) << text;
    }
}

} // namespace qelo::test
