// The record of one service: its fields, and what each access leaves in the trace.
#include "ServiceFixture.h"

#include <service/SimAccountManagementService.h>

#include <algorithm>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::SimAccountManagementService;

const Unit& unit = source::service;

class ServiceRecord : public testing::Test {
protected:
    ServiceRecord() { platform_.reset(); }

    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }

    // That a setter traced its entry, the variable and its exit in this order, and that it
    // was invoked.
    void expectSetter(const std::string& function, const std::string& piece,
                      const std::string& variable, const std::string& value) {
        std::vector<std::string> recorded = points();
        const auto invoked = std::find(recorded.begin(), recorded.end(),
                                       ExpectedTrace().method(unit, function).points().at(0));
        EXPECT_NE(invoked, recorded.end());
        if (invoked != recorded.end()) {
            recorded.erase(invoked);
        }
        const std::string params = " " + piece + "=" + value;
        expectSamePoints(recorded, ExpectedTrace()
                                       .entering(unit, function, params)
                                       .variable(unit, function, variable, value)
                                       .exiting(unit, function, params));
        platform_.forget();
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    SimAccountManagementService service_;
};

TEST_F(ServiceRecord, Is_empty_at_first) {
    EXPECT_EQ(service_.getName(), "");
    EXPECT_EQ(service_.getElementName(), "");
    EXPECT_EQ(service_.getRequestedState(), 0U);
    EXPECT_EQ(service_.getEnabledState(), 0U);
}

TEST_F(ServiceRecord, Setters_take_every_value_and_answer_false) {
    EXPECT_FALSE(service_.setName("name"));
    EXPECT_FALSE(service_.setElementName("element"));
    EXPECT_FALSE(service_.setRequestedState(65535));
    EXPECT_FALSE(service_.setEnabledState(3));
    EXPECT_EQ(service_.getName(), "name");
    EXPECT_EQ(service_.getElementName(), "element");
    EXPECT_EQ(service_.getRequestedState(), 65535U);
    EXPECT_EQ(service_.getEnabledState(), 3U);
    EXPECT_FALSE(service_.setName(""));
    EXPECT_EQ(service_.getName(), "");
    EXPECT_EQ(platform_.storeCallCount(), 0U);
}

TEST_F(ServiceRecord, Each_getter_traces_that_it_was_invoked_and_the_value) {
    service_.setName("name");
    service_.setElementName("element");
    service_.setRequestedState(12);
    service_.setEnabledState(2);
    platform_.forget();
    service_.getName();
    service_.getElementName();
    service_.getRequestedState();
    service_.getEnabledState();
    expectSamePoints(points(), ExpectedTrace()
                                   .method(unit, "getName")
                                   .variable(unit, "getName", "_name", "name")
                                   .method(unit, "getElementName")
                                   .variable(unit, "getElementName", "_elementName", "element")
                                   .method(unit, "getRequestedState")
                                   .variable(unit, "getRequestedState", "_requestedState", "12")
                                   .method(unit, "getEnabledState")
                                   .variable(unit, "getEnabledState", "_enabledState", "2"));
}

TEST_F(ServiceRecord, Each_setter_traces_itself_entry_the_value_and_exit) {
    service_.setName("name");
    expectSetter("setName", "name", "_name", "name");
    service_.setElementName("element");
    expectSetter("setElementName", "elementName", "_elementName", "element");
    service_.setRequestedState(12);
    expectSetter("setRequestedState", "requestedState", "_requestedState", "12");
    service_.setEnabledState(2);
    expectSetter("setEnabledState", "enabledState", "_enabledState", "2");
}

} // namespace
} // namespace qelo::test
