// The real accounts of the machine that the test runs on; they are only read.
#include "Qelosim.h"

#include <map>
#include <sstream>

namespace qelo::endtoend {
namespace {

std::vector<std::string> fieldsOf(const std::string& line) {
    std::vector<std::string> fields;
    std::istringstream stream(line);
    for (std::string field; std::getline(stream, field, ':');) {
        fields.push_back(field);
    }
    fields.resize(7);
    return fields;
}

// Name -> UID, GID, full name, home directory, shell.
using Accounts = std::map<std::string, std::vector<std::string>>;

Accounts accountsOfTheSystem(const std::string& listing) {
    Accounts accounts;
    std::istringstream lines(listing);
    for (std::string line; std::getline(lines, line);) {
        const auto fields = fieldsOf(line);
        const std::string fullName = fields[4].substr(0, fields[4].find(','));
        accounts[fields[0]] = {fields[2], fields[3], fullName, fields[5], fields[6]};
    }
    return accounts;
}

TEST(ThisMachine, Its_accounts_are_those_that_the_system_itself_lists) {
    const Finished listing = runProcess({"getent", "-s", "files", "passwd"});
    if (listing.status != 0) {
        GTEST_SKIP() << "getent cannot list the accounts of this machine: " << listing.err;
    }
    Accounts served;
    for (const auto& account : qelosimJson({"accounts", "--store", "accounts:/"})) {
        const auto& properties = account["properties"];
        served[properties["Name"]] = {
            properties["UserID"], std::to_string(properties["GroupId"].get<unsigned int>()),
            properties["Description"], properties["HomeDirectory"], properties["ScriptPath"]};
    }
    EXPECT_EQ(served, accountsOfTheSystem(listing.out));
    EXPECT_FALSE(served.empty());
}

TEST(ThisMachine, Its_groups_are_those_that_the_system_itself_lists) {
    const Finished listing = runProcess({"getent", "-s", "files", "group"});
    if (listing.status != 0) {
        GTEST_SKIP() << "getent cannot list the groups of this machine: " << listing.err;
    }
    std::map<std::string, std::string> expected;
    std::istringstream lines(listing.out);
    for (std::string line; std::getline(lines, line);) {
        const auto fields = fieldsOf(line);
        expected[fields[0]] = fields[3];
    }
    std::map<std::string, std::string> served;
    for (const auto& group : qelosimJson({"groups", "--store", "accounts:/"})) {
        served[group["properties"]["Name"]] = group["properties"]["GroupMembers"];
    }
    EXPECT_EQ(served, expected);
}

} // namespace
} // namespace qelo::endtoend
