// A stock CIM client, wbemcli, against the server.
#include "Qelosim.h"
#include "Server.h"

#include <gmock/gmock.h>

#include <sstream>

namespace qelo::endtoend {
namespace {

using testing::HasSubstr;
using testing::Not;

constexpr char kNameSpace[] = "root/cimv2:";

class Wbemcli : public AccountDatabase {
protected:
    void SetUp() override {
        AccountDatabase::SetUp();
        if (runProcess({"wbemcli"}).status == 127) {
            GTEST_SKIP() << "wbemcli is not installed";
        }
        server_ =
            std::make_unique<Server>(std::vector<std::string>{"--no-auth", "--store", store()});
        ASSERT_NE(server_->url(), "") << server_->errors();
    }

    // Options come first, then the operation's object and further words.
    Finished wbemcli(const std::string& operation, const std::string& object,
                     const std::vector<std::string>& options = {},
                     const std::vector<std::string>& more = {}) const {
        std::vector<std::string> command = {"wbemcli", operation};
        command.insert(command.end(), options.begin(), options.end());
        command.push_back(server_->object(object.empty() ? "root/cimv2" : kNameSpace + object));
        command.insert(command.end(), more.begin(), more.end());
        return runProcess(command);
    }
    static std::vector<std::string> lines(const Finished& finished) {
        EXPECT_EQ(finished.err, "");
        std::vector<std::string> result;
        std::istringstream text(finished.out);
        for (std::string line; std::getline(text, line);) {
            result.push_back(line);
        }
        return result;
    }
    // The keys of the first instance of a class as wbemcli prints them.
    std::string firstPath(const std::string& className) const {
        const auto found = lines(wbemcli("ein", className));
        if (found.empty()) {
            ADD_FAILURE() << className << " has no instance";
            return {};
        }
        return found[0].substr(found[0].find(':', found[0].find('/')) + 1);
    }
    static void expectError(const Finished& finished, const std::string& name) {
        EXPECT_EQ(finished.out, "");
        EXPECT_THAT(finished.err, HasSubstr(name));
    }

    std::unique_ptr<Server> server_;
};

constexpr const char* kInstanceClasses[] = {
    "ZANTH_Account",
    "ZANTH_Group",
    "ZANTH_SimIdentity",
    "ZANTH_AccountManagementService",
    "ZANTH_AccountManagementCapabilities",
    "ZANTH_AccountHostedService",
    "ZANTH_SimElementCapabilities",
    "ZANTH_ComputerSystem",
};

TEST_F(Wbemcli, Lists_the_names_of_all_classes) {
    for (const char* className : kInstanceClasses) {
        const Finished finished = wbemcli("ein", className);
        EXPECT_EQ(finished.err, "") << className;
        EXPECT_THAT(finished.out, HasSubstr(std::string(kNameSpace) + className + "."))
            << className;
    }
    EXPECT_EQ(lines(wbemcli("ein", "ZANTH_Account")).size(), 4U);
    EXPECT_EQ(lines(wbemcli("ein", "ZANTH_Group")).size(), 4U);
}

TEST_F(Wbemcli, Lists_the_instances_of_all_classes) {
    for (const char* className : kInstanceClasses) {
        const Finished finished = wbemcli("ei", className);
        EXPECT_EQ(finished.err, "") << className;
        EXPECT_THAT(finished.out, HasSubstr(className)) << className;
    }
    const std::string accounts = wbemcli("ei", "ZANTH_Account").out;
    EXPECT_THAT(accounts, HasSubstr("Description=\"Alice Example\""));
    EXPECT_THAT(accounts, HasSubstr("UserID=\"1001\""));
    EXPECT_THAT(accounts, HasSubstr("山田 花子"));
    EXPECT_THAT(wbemcli("ei", "ZANTH_Group").out, HasSubstr("root,alice"));
}

TEST_F(Wbemcli, A_superclass_finds_the_subclasses) {
    EXPECT_EQ(lines(wbemcli("ein", "CIM_Account")).size(), 4U);
    EXPECT_EQ(lines(wbemcli("ein", "CIM_Group")).size(), 4U);
    EXPECT_GE(lines(wbemcli("ein", "CIM_ManagedElement")).size(), 12U);
    EXPECT_THAT(wbemcli("ein", "CIM_HostedService").out, HasSubstr("ZANTH_AccountHostedService"));
}

TEST_F(Wbemcli, Gets_the_first_instance_of_all_classes) {
    for (const char* className : kInstanceClasses) {
        const Finished finished = wbemcli("gi", firstPath(className));
        EXPECT_EQ(finished.err, "") << className;
        EXPECT_THAT(finished.out, HasSubstr(className));
    }
}

TEST_F(Wbemcli, Gets_the_properties_that_it_names) {
    const std::string path = firstPath("ZANTH_Account");
    const Finished finished = wbemcli("gi", path, {}, {"UserID,EnabledState"});
    EXPECT_THAT(finished.out, HasSubstr("UserID="));
    EXPECT_THAT(finished.out, HasSubstr("EnabledState="));
    EXPECT_THAT(finished.out, Not(HasSubstr("Description=")));
}

TEST_F(Wbemcli, Follows_the_associations_both_ways) {
    const std::string system = firstPath("ZANTH_ComputerSystem");
    const std::string service = firstPath("ZANTH_AccountManagementService");
    const std::string capabilities = firstPath("ZANTH_AccountManagementCapabilities");
    EXPECT_THAT(wbemcli("ain", system).out, HasSubstr(service));
    EXPECT_THAT(wbemcli("ain", capabilities).out, HasSubstr(service));
    const std::string both = wbemcli("ain", service).out;
    EXPECT_THAT(both, HasSubstr(system));
    EXPECT_THAT(both, HasSubstr(capabilities));
    EXPECT_THAT(wbemcli("ain", service, {"-ac", "ZANTH_SimElementCapabilities"}).out,
                Not(HasSubstr(system)));
    EXPECT_THAT(wbemcli("ain", service, {"-arc", "CIM_ComputerSystem"}).out, HasSubstr(system));
    EXPECT_THAT(wbemcli("ai", system).out, HasSubstr("ElementName="));
    EXPECT_THAT(wbemcli("rin", system).out, HasSubstr("ZANTH_AccountHostedService"));
    EXPECT_THAT(wbemcli("rin", service, {"-ar", "Dependent"}).out,
                HasSubstr("ZANTH_AccountHostedService"));
    EXPECT_THAT(wbemcli("ri", service).out, HasSubstr("ZANTH_SimElementCapabilities"));
}

TEST_F(Wbemcli, Gets_classes_and_their_names) {
    EXPECT_THAT(wbemcli("gc", "ZANTH_Account").out, HasSubstr("daysMustChangePasswordAfter"));
    EXPECT_THAT(wbemcli("ecn", "").out, HasSubstr("CIM_ManagedElement"));
    EXPECT_THAT(wbemcli("ecn", "CIM_Account").out, HasSubstr("ZANTH_Account"));
    EXPECT_THAT(wbemcli("ec", "CIM_Group").out, HasSubstr("GroupMembers"));
}

TEST_F(Wbemcli, Calls_methods) {
    const Finished finished =
        wbemcli("cm", "ZANTH_Account", {}, {"ModifyUser.Name=\"alice\",FullName=\"Alice New\""});
    EXPECT_EQ(finished.err, "");
    EXPECT_THAT(finished.out, HasSubstr("ModifyUser: 0"));
    EXPECT_THAT(wbemcli("ei", "ZANTH_Account").out, HasSubstr("Alice New"));
}

TEST_F(Wbemcli, Is_told_what_is_wrong) {
    expectError(wbemcli("ein", "ZANTH_Nothing"), "CIM_ERR_INVALID_CLASS");
    expectError(wbemcli("ei", "ZANTH_Nothing"), "CIM_ERR_INVALID_CLASS");
    expectError(wbemcli("gc", "ZANTH_Nothing"), "CIM_ERR_NOT_FOUND");
    expectError(wbemcli("gi", "ZANTH_Group.CreationClassName=\"ZANTH_Group\",Name=\"none\""),
                "CIM_ERR_NOT_FOUND");
    expectError(wbemcli("cm", "ZANTH_Account", {}, {"DeleteUser.Name=\"root\""}), "CIM_ERR_FAILED");
    expectError(wbemcli("di", firstPath("ZANTH_Group")), "CIM_ERR_NOT_SUPPORTED");
    expectError(wbemcli("ain", "ZANTH_Nothing.Name=\"x\""), "CIM_ERR_INVALID_PARAMETER");
    expectError(runProcess({"wbemcli", "ein", server_->object("root/nowhere:ZANTH_Group")}),
                "CIM_ERR_INVALID_NAMESPACE");
}

} // namespace
} // namespace qelo::endtoend
