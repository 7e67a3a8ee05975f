// The record of one group: its fields, and what each access leaves in the trace.
#include "GroupFixture.h"

#include <group/SimGroup.h>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimGroup;

class GroupRecord : public testing::Test {
protected:
    GroupRecord() { platform_.reset(); }

    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
};

TEST_F(GroupRecord, Is_empty_at_first) {
    SimGroup group;
    EXPECT_EQ(group.getName(), "");
    EXPECT_EQ(group.getElementName(), "");
    EXPECT_EQ(group.getMembers(), "");
}

TEST_F(GroupRecord, Setters_take_every_value_and_answer_false) {
    SimGroup group;
    EXPECT_FALSE(group.setName("wheel"));
    EXPECT_FALSE(group.setElementName("element"));
    EXPECT_FALSE(group.setMembers("a,b"));
    EXPECT_EQ(group.getName(), "wheel");
    EXPECT_EQ(group.getElementName(), "element");
    EXPECT_EQ(group.getMembers(), "a,b");
    EXPECT_FALSE(group.setName(""));
    EXPECT_EQ(group.getName(), "");
}

TEST_F(GroupRecord, Copies_are_independent) {
    SimGroup group;
    group.setName("wheel");
    SimGroup copy = group;
    group.setName("staff");
    EXPECT_EQ(copy.getName(), "wheel");
    copy = group;
    EXPECT_EQ(copy.getName(), "staff");
}

TEST_F(GroupRecord, Construction_and_destruction_are_traced) {
    { SimGroup group; }
    expectSamePoints(
        points(),
        ExpectedTrace().method(source::group, "SimGroup").method(source::group, "~SimGroup"));
}

TEST_F(GroupRecord, Each_getter_traces_that_it_was_invoked_and_the_value) {
    SimGroup group;
    group.setName("wheel");
    group.setElementName("element");
    group.setMembers("a,b");
    platform_.forget();
    group.getName();
    group.getElementName();
    group.getMembers();
    expectSamePoints(points(),
                     ExpectedTrace()
                         .method(source::group, "getName")
                         .variable(source::group, "getName", "_name", "wheel")
                         .method(source::group, "getElementName")
                         .variable(source::group, "getElementName", "_elementName", "element")
                         .method(source::group, "getMembers")
                         .variable(source::group, "getMembers", "_members", "a,b"));
}

TEST_F(GroupRecord, Each_setter_traces_entry_the_value_and_exit) {
    SimGroup group;
    platform_.forget();
    group.setName("wheel");
    group.setElementName("element");
    group.setMembers("a,b");
    expectSamePoints(points(),
                     ExpectedTrace()
                         .entering(source::group, "setName", " name=wheel")
                         .variable(source::group, "setName", "_name", "wheel")
                         .exiting(source::group, "setName", " name=wheel")
                         .entering(source::group, "setElementName", " elementName=element")
                         .variable(source::group, "setElementName", "_elementName", "element")
                         .exiting(source::group, "setElementName", " elementName=element")
                         .entering(source::group, "setMembers", " member=a,b")
                         .variable(source::group, "setMembers", "_members", "a,b")
                         .exiting(source::group, "setMembers", " member=a,b"));
}

TEST_F(GroupRecord, Two_blanks_stand_before_the_first_parameter) {
    SimGroup group;
    platform_.forget();
    group.setName("wheel");
    EXPECT_NE(platform_.lines()[0].message.find(",Parameters List:  name=wheel"),
              std::string::npos);
}

TEST_F(GroupRecord, A_value_of_600_characters_is_kept_whole_and_traced_cut_at_511) {
    const std::string name(600, 'g');
    SimGroup group;
    platform_.forget();
    group.setName(name);
    EXPECT_EQ(group.getName(), name);
    const std::vector<LogLine> lines = platform_.lines(Sink::Trace);
    ASSERT_EQ(lines.size(), 5U);
    EXPECT_EQ(lines[0].message.size(), 511U);
    EXPECT_EQ(lines[1].message, "VARIABLE: '_name' has Value '" + std::string(482, 'g'));
    EXPECT_EQ(lines[2].message.size(), 511U);
}

} // namespace
} // namespace qelo::test
