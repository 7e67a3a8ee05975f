// Reading services from the node store.
#include "ServiceFixture.h"

#include <service/SimAccountManagementService.h>

#include <algorithm>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::getSimAccountManagementServiceInstances;
using Tesk::SimpleIdentityManagementProvider::setSimAccountManagementServiceVector;
using Tesk::SimpleIdentityManagementProvider::SimAccountManagementService;
using testing::ElementsAre;
using testing::IsEmpty;

const Unit& unit = source::service;
constexpr const char* loader = "getSimAccountManagementServiceInstances";
const std::string params = " vectSimAccountManagementService=@";

class ServiceLoader : public testing::Test {
protected:
    ServiceLoader() { platform_.reset(); }
    ~ServiceLoader() override { EXPECT_EQ(platform_.openCursors(), 0U); }

    std::vector<std::string> names() {
        std::vector<std::string> all;
        for (SimAccountManagementService& record : records_) {
            all.push_back(record.getName());
        }
        return all;
    }

    std::vector<std::string> storeCalls() const {
        std::vector<std::string> texts = platform_.storeCallTexts();
        texts.erase(
            std::remove_if(texts.begin(), texts.end(),
                           [](const std::string& text) { return text.find("operator bool") == 0; }),
            texts.end());
        return texts;
    }

    std::vector<std::string> points() const { return tracePoints(platform_.lines()); }

    // The functions that were entered, in order.
    std::vector<std::string> entered() const {
        std::vector<std::string> functions;
        for (const LogLine& line : platform_.lines(Sink::Log)) {
            if (line.message.find("ENTERING: ") == 0) {
                functions.push_back(line.function);
            }
        }
        return functions;
    }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
    std::vector<SimAccountManagementService> records_;
};

TEST_F(ServiceLoader, Appends_one_record_per_node_in_store_order) {
    platform_.addNode(serviceNode("/b"));
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    EXPECT_FALSE(getSimAccountManagementServiceInstances(records_));
    EXPECT_THAT(names(), ElementsAre(serviceName("/b"), serviceName("/a"), serviceName("/b")));
}

TEST_F(ServiceLoader, Name_and_ElementName_are_the_prefix_and_the_path_text) {
    platform_.addNode(serviceNode("/services/1"));
    getSimAccountManagementServiceInstances(records_);
    SimAccountManagementService& record = records_.at(0);
    EXPECT_EQ(record.getName(), "SimAccountManagementService_node:/services/1");
    EXPECT_EQ(record.getElementName(), "SimAccountManagementService_node:/services/1");
    EXPECT_EQ(record.getRequestedState(), 12U);
    EXPECT_EQ(record.getEnabledState(), 2U);
}

TEST_F(ServiceLoader, Only_the_path_of_each_node_is_read) {
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    getSimAccountManagementServiceInstances(records_);
    EXPECT_THAT(storeCalls(),
                ElementsAre("Instrumentation()", "selectNode(40)", "getPathToNode()->/a",
                            "convertPathToString(/a)->node:/a", "operator++()",
                            "getPathToNode()->/b", "convertPathToString(/b)->node:/b",
                            "operator++()", "~Instrumentation()"));
}

TEST_F(ServiceLoader, The_setters_are_called_in_their_fixed_order) {
    platform_.addNode(serviceNode("/a"));
    getSimAccountManagementServiceInstances(records_);
    std::vector<std::string> setters;
    for (const std::string& function : entered()) {
        if (function.find("set") == 0 && function != "setSimAccountManagementServiceVector") {
            setters.push_back(function);
        }
    }
    EXPECT_THAT(setters,
                ElementsAre("setName", "setRequestedState", "setEnabledState", "setElementName"));
}

TEST_F(ServiceLoader, Without_a_service_node_it_reports_failure) {
    EXPECT_TRUE(getSimAccountManagementServiceInstances(records_));
    EXPECT_THAT(records_, IsEmpty());
    expectSamePoints(points(),
                     ExpectedTrace().entering(unit, loader, params).exiting(unit, loader, params));
}

TEST_F(ServiceLoader, Entry_and_exit_are_traced_with_the_vector) {
    platform_.addNode(serviceNode("/a"));
    getSimAccountManagementServiceInstances(records_);
    const auto expected =
        ExpectedTrace().entering(unit, loader, params).exiting(unit, loader, params).points();
    EXPECT_EQ(points().front(), expected[0]);
    EXPECT_EQ(points().back(), expected[1]);
}

TEST_F(ServiceLoader, The_vector_loader_appends_from_the_cursor_on_and_answers_false) {
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    Tesk::Instrumentation cursor;
    cursor.selectNode(Tesk::NodeLexicon::AccountServiceRoot);
    ++cursor;
    EXPECT_FALSE(setSimAccountManagementServiceVector(records_, cursor));
    EXPECT_THAT(names(), ElementsAre(serviceName("/b")));
    EXPECT_FALSE(cursor);
}

TEST_F(ServiceLoader, A_failing_store_is_traced_and_reported) {
    platform_.addNode(serviceNode("/a"));
    platform_.addNode(serviceNode("/b"));
    platform_.failOperation("getPathToNode", 2, StoreFault::ThrowsRuntimeError);
    EXPECT_TRUE(getSimAccountManagementServiceInstances(records_));
    EXPECT_THAT(names(), ElementsAre(serviceName("/a")));
    const auto expected = ExpectedTrace()
                              .message(unit, loader, storeFailureText)
                              .exiting(unit, loader, params)
                              .points();
    EXPECT_THAT(points(), testing::Contains(expected[0]));
    EXPECT_THAT(points(), testing::Contains(expected[1]));
}

TEST_F(ServiceLoader, A_store_that_fails_at_any_call_is_reported) {
    for (const char* operation : {"Instrumentation", "selectNode", "operator bool", "getPathToNode",
                                  "convertPathToString", "operator++"}) {
        platform_.reset();
        platform_.addNode(serviceNode("/a"));
        platform_.failOperation(operation, 1, StoreFault::ThrowsRuntimeError);
        EXPECT_TRUE(getSimAccountManagementServiceInstances(records_)) << operation;
        EXPECT_EQ(platform_.openCursors(), 0U) << operation;
    }
}

} // namespace
} // namespace qelo::test
