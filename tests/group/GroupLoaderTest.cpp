// Reading groups from the node store.
#include "GroupFixture.h"

#include <group/SimGroup.h>

#include <algorithm>

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using Tesk::SimpleIdentityManagementProvider::getSimGroupInstances;
using Tesk::SimpleIdentityManagementProvider::setVector;
using Tesk::SimpleIdentityManagementProvider::SimGroup;
using testing::Contains;
using testing::ElementsAre;

class GroupLoader : public testing::Test {
protected:
    GroupLoader() { platform_.reset(); }
    ~GroupLoader() override { EXPECT_EQ(platform_.openCursors(), 0U); }

    // The members of the only group, after loading these.
    std::string loaded(const std::vector<std::string>& members) {
        platform_.reset();
        platform_.addNode(groupNode("wheel", members));
        records_.clear();
        EXPECT_FALSE(getSimGroupInstances(records_));
        EXPECT_EQ(records_.size(), 1U);
        return records_.empty() ? "" : records_[0].getMembers();
    }

    std::vector<std::string> names() {
        std::vector<std::string> all;
        for (SimGroup& record : records_) {
            all.push_back(record.getName());
        }
        return all;
    }

    // What the store was asked, apart from whether there is a node.
    std::vector<std::string> storeCalls() const {
        std::vector<std::string> texts = platform_.storeCallTexts();
        texts.erase(
            std::remove_if(texts.begin(), texts.end(),
                           [](const std::string& text) { return text.find("operator bool") == 0; }),
            texts.end());
        return texts;
    }

    std::vector<std::string> points() const {
        return withoutDestructors(tracePoints(platform_.lines()), "~SimGroup");
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    std::vector<SimGroup> records_;
};

TEST_F(GroupLoader, Appends_one_record_per_group_in_store_order) {
    platform_.addNode(groupNode("wheel", {"root"}));
    platform_.addNode(groupNode("adm", {}));
    platform_.addNode(groupNode("wheel", {"eve"}));
    EXPECT_FALSE(getSimGroupInstances(records_));
    EXPECT_THAT(names(), ElementsAre("wheel", "adm", "wheel"));
    EXPECT_FALSE(getSimGroupInstances(records_));
    EXPECT_EQ(records_.size(), 6U) << "the vector is not cleared first";
}

TEST_F(GroupLoader, ElementName_is_the_name) {
    platform_.addNode(groupNode("wheel"));
    getSimGroupInstances(records_);
    EXPECT_EQ(records_.at(0).getElementName(), "wheel");
}

TEST_F(GroupLoader, Two_members_are_joined_by_one_comma_and_none_trails) {
    EXPECT_EQ(loaded({"a", "b"}), "a,b");
}

TEST_F(GroupLoader, An_empty_member_vector_gives_the_empty_string) { EXPECT_EQ(loaded({}), ""); }

TEST_F(GroupLoader, Members_keep_their_order_and_their_empty_elements) {
    EXPECT_EQ(loaded({"c", "a", "b", "a"}), "c,a,b,a");
    EXPECT_EQ(loaded({"a", "", "b"}), "a,,b");
    EXPECT_EQ(loaded({"", "a"}), ",a");
}

TEST_F(GroupLoader, Only_the_last_comma_is_taken_away) {
    EXPECT_EQ(loaded({"a", ""}), "a,");
    EXPECT_EQ(loaded({""}), "");
    EXPECT_EQ(loaded({"", ""}), ",");
    EXPECT_EQ(loaded({"a,"}), "a,");
}

TEST_F(GroupLoader, Without_a_group_node_it_reports_failure_and_leaves_the_vector) {
    records_.emplace_back();
    EXPECT_TRUE(getSimGroupInstances(records_));
    EXPECT_EQ(records_.size(), 1U);
    EXPECT_THAT(storeCalls(),
                ElementsAre("Instrumentation()", "selectNode(51)", "~Instrumentation()"));
}

TEST_F(GroupLoader, A_group_without_a_readable_name_yields_a_record_with_empty_names) {
    StoreNode node = bareGroupNode();
    node.properties[GroupMembers] = std::vector<std::string>{"a"};
    platform_.addNode(node);
    EXPECT_FALSE(getSimGroupInstances(records_));
    ASSERT_EQ(records_.size(), 1U);
    EXPECT_EQ(records_[0].getName(), "");
    EXPECT_EQ(records_[0].getElementName(), "");
    EXPECT_EQ(records_[0].getMembers(), "a");
}

TEST_F(GroupLoader, A_group_without_readable_members_has_none) {
    StoreNode node = bareGroupNode();
    node.properties[Name] = "wheel";
    platform_.addNode(node);
    EXPECT_FALSE(getSimGroupInstances(records_));
    EXPECT_EQ(records_.at(0).getName(), "wheel");
    EXPECT_EQ(records_.at(0).getMembers(), "");
}

TEST_F(GroupLoader, A_property_of_another_type_counts_as_unreadable) {
    StoreNode node = bareGroupNode();
    node.properties[Name] = 7U;
    node.properties[GroupMembers] = "a,b";
    platform_.addNode(node);
    EXPECT_FALSE(getSimGroupInstances(records_));
    EXPECT_EQ(records_.at(0).getName(), "");
    EXPECT_EQ(records_.at(0).getMembers(), "");
}

TEST_F(GroupLoader, One_groups_values_do_not_reach_the_next) {
    platform_.addNode(groupNode("wheel", {"root"}));
    platform_.addNode(bareGroupNode());
    getSimGroupInstances(records_);
    EXPECT_EQ(records_.at(1).getName(), "");
    EXPECT_EQ(records_.at(1).getMembers(), "");
}

TEST_F(GroupLoader, Reads_name_and_members_of_each_group_and_nothing_else) {
    platform_.addNode(groupNode("wheel", {"a", "b"}));
    platform_.addNode(groupNode("adm", {}));
    getSimGroupInstances(records_);
    EXPECT_THAT(storeCalls(),
                ElementsAre("Instrumentation()", "selectNode(51)", "getProperty(108,string)->wheel",
                            "getProperty(165,string list)->[a,b]", "operator++()",
                            "getProperty(108,string)->adm", "getProperty(165,string list)->[]",
                            "operator++()", "~Instrumentation()"));
}

TEST_F(GroupLoader, Reading_one_group_leaves_exactly_these_lines) {
    platform_.addNode(groupNode("wheel", {"a", "b"}));
    getSimGroupInstances(records_);
    const Unit unit = source::group;
    const std::string vector = " vectSimGroup=@";
    const std::string cursor = " vectSimGroup=@ instrumentation=1";
    expectSamePoints(points(), ExpectedTrace()
                                   .entering(unit, "getSimGroupInstances", vector)
                                   .entering(unit, "setVector", cursor)
                                   .method(unit, "SimGroup")
                                   .entering(unit, "setName", " name=wheel")
                                   .variable(unit, "setName", "_name", "wheel")
                                   .exiting(unit, "setName", " name=wheel")
                                   .entering(unit, "setElementName", " elementName=wheel")
                                   .variable(unit, "setElementName", "_elementName", "wheel")
                                   .exiting(unit, "setElementName", " elementName=wheel")
                                   .entering(unit, "setMembers", " member=a,b")
                                   .variable(unit, "setMembers", "_members", "a,b")
                                   .exiting(unit, "setMembers", " member=a,b")
                                   .exiting(unit, "setVector", cursor)
                                   .exiting(unit, "getSimGroupInstances", vector));
}

TEST_F(GroupLoader, Without_a_group_entry_and_exit_alone_are_traced) {
    getSimGroupInstances(records_);
    const std::string vector = " vectSimGroup=@";
    expectSamePoints(points(), ExpectedTrace()
                                   .entering(source::group, "getSimGroupInstances", vector)
                                   .exiting(source::group, "getSimGroupInstances", vector));
}

TEST_F(GroupLoader, SetVector_appends_from_where_the_cursor_stands_and_answers_false) {
    platform_.addNode(groupNode("first"));
    platform_.addNode(groupNode("second"));
    Tesk::Instrumentation cursor;
    cursor.selectNode(UserGroup);
    ++cursor;
    EXPECT_FALSE(setVector(records_, cursor));
    EXPECT_THAT(names(), ElementsAre("second"));
    EXPECT_FALSE(cursor);
    EXPECT_FALSE(setVector(records_, cursor)) << "also past the last node";
    EXPECT_EQ(records_.size(), 1U);
}

TEST_F(GroupLoader, A_failing_store_is_reported_and_keeps_earlier_groups) {
    platform_.addNode(groupNode("wheel"));
    platform_.addNode(groupNode("adm"));
    platform_.failOperation("getProperty", 3, StoreFault::ThrowsRuntimeError);
    EXPECT_TRUE(getSimGroupInstances(records_));
    EXPECT_THAT(names(), ElementsAre("wheel"));
    EXPECT_THAT(points(), Contains(pointText(
                              source::group.component, "getSimGroupInstances", source::group.file,
                              6000, "MESSAGE [File: SimGroup, Line: #]: the store failed")));
}

TEST_F(GroupLoader, A_store_that_fails_at_any_call_is_reported) {
    for (const char* operation :
         {"Instrumentation", "selectNode", "operator bool", "getProperty", "operator++"}) {
        platform_.reset();
        platform_.addNode(groupNode("wheel"));
        platform_.failOperation(operation, 1, StoreFault::ThrowsRuntimeError);
        EXPECT_TRUE(getSimGroupInstances(records_)) << operation;
        EXPECT_EQ(platform_.openCursors(), 0U) << operation;
    }
}

TEST_F(GroupLoader, What_is_no_exception_of_the_language_passes_on) {
    platform_.addNode(groupNode("wheel"));
    platform_.failOperation("getProperty", 1, StoreFault::ThrowsForeign);
    EXPECT_THROW(getSimGroupInstances(records_), ForeignFailure);
}

} // namespace
} // namespace qelo::test
