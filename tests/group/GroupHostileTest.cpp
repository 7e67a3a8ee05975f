// Group data that means harm.
#include "GroupFixture.h"

#include <algorithm>

namespace qelo::test {
namespace {

using testing::ElementsAre;
using testing::UnorderedElementsAreArray;

class HostileGroups : public GroupFixture {
protected:
    std::size_t longestLine() const {
        std::size_t longest = 0;
        for (const LogLine& line : platform_.lines()) {
            longest = std::max(longest, line.message.size());
        }
        return longest;
    }
};

const std::vector<std::string>& hostileNames() {
    static const std::vector<std::string> names = {
        std::string(600, 'a'), std::string(100000, 'b'),    "%s%s%s%n%n%n%d%x",
        "new\nline\r\n",       "quote\"'`$(reboot)",        "a,b:c",
        "\x01\x02\x7F",        "\xFF\xFE bad UTF-8 \xC3",   "\x1b[31mred",
        "../../etc/shadow",    "//host/root/cimv2:C.k=\"v", " ",
    };
    return names;
}

TEST_F(HostileGroups, Names_are_served_unchanged) {
    std::vector<StoreNode> nodes;
    for (const std::string& name : hostileNames()) {
        nodes.push_back(groupNode(name, {name}));
    }
    serve(nodes);
    expectOk(enumInstances());
    EXPECT_THAT(returned("Name"), UnorderedElementsAreArray(hostileNames()));
    EXPECT_THAT(returned("GroupMembers"), UnorderedElementsAreArray(hostileNames()));
    EXPECT_THAT(returned("Description"), UnorderedElementsAreArray(hostileNames()));
    EXPECT_EQ(longestLine(), 511U);
    expectOk(enumNames());
    EXPECT_THAT(returned("Name"), UnorderedElementsAreArray(hostileNames()));
    EXPECT_EQ(longestLine(), 511U);
}

TEST_F(HostileGroups, Each_can_be_looked_up) {
    for (const std::string& name : hostileNames()) {
        platform_.reset();
        serve({groupNode(name)});
        expectOk(getInstance(groupKeys(name)));
        EXPECT_THAT(returned("Name"), ElementsAre(name));
    }
}

TEST_F(HostileGroups, A_name_of_600_characters_may_be_asked_for_in_vain) {
    serve({groupNode("wheel")});
    expectOk(getInstance(groupKeys(std::string(600, 'a'))));
    expectNothingReturned();
}

TEST_F(HostileGroups, Half_a_megabyte_of_members_is_served_whole_and_traced_cut) {
    std::vector<std::string> members;
    std::string joined;
    while (joined.size() < 512UL * 1024) {
        members.push_back("member" + std::to_string(members.size()));
        joined += (joined.empty() ? "" : ",") + members.back();
    }
    serve({groupNode("wheel", members)});
    expectOk(enumInstances());
    EXPECT_EQ(onlyInstance().propertyText("GroupMembers"), joined);
    EXPECT_EQ(longestLine(), 511U);
}

TEST_F(HostileGroups, One_member_of_half_a_megabyte_is_served_whole) {
    const std::string member(512UL * 1024, 'm');
    serve({groupNode("wheel", {member, "b"})});
    expectOk(getInstance(groupKeys("wheel")));
    EXPECT_EQ(onlyInstance().propertyText("GroupMembers"), member + ",b");
    EXPECT_EQ(longestLine(), 511U);
}

TEST_F(HostileGroups, A_method_name_and_arguments_of_any_length_stay_within_bounds) {
    serve({groupNode("wheel")});
    const std::string longText(512UL * 1024, 'x');
    expectOk(invoke(longText.c_str(), broker_.makeArgs().string(longText, longText)));
    EXPECT_EQ(platform_.commands().at(0).size(), 1023U);
    EXPECT_EQ(longestLine(), 511U);
}

TEST_F(HostileGroups, A_list_of_100000_property_names_ends) {
    broker_.ignorePropertyFilter(true);
    serve({groupNode("wheel")});
    expectOk(enumInstances(std::vector<const char*>(100000, "Unknown")));
    EXPECT_THAT(onlyInstance().propertyNames(), ElementsAre("CreationClassName", "Name"));
}

} // namespace
} // namespace qelo::test
