// The record of one capabilities object, and reading them from the node store.
#include "ServiceFixture.h"

#include <service/SimAccountManagementCapabilities.h>

#include <algorithm>

namespace qelo::test {
namespace {

using Tesk::SimpleIdentityManagementProvider::getSimAccountManagementCapabilitiesInstances;
using Tesk::SimpleIdentityManagementProvider::SimAccountManagementCapabilities;
using testing::ElementsAre;
using testing::IsEmpty;

// Neither the record nor its loader ever traces.
class Capabilities : public testing::Test {
protected:
    Capabilities() { platform_.reset(); }
    ~Capabilities() override { EXPECT_EQ(platform_.lineCount(), 0U); }

    RecordingPlatform& platform_ = RecordingPlatform::instance();
};

class CapabilitiesRecord : public Capabilities {
protected:
    SimAccountManagementCapabilities record_;
};

TEST_F(CapabilitiesRecord, Is_empty_at_first) {
    EXPECT_EQ(record_.getInstanceID(), "");
    EXPECT_EQ(record_.getElementName(), "");
    EXPECT_FALSE(record_.getElementNameEditSupported());
}

TEST_F(CapabilitiesRecord, Setters_answer_true_unless_the_value_is_empty) {
    EXPECT_TRUE(record_.setInstanceID("id"));
    EXPECT_TRUE(record_.setElementName("element"));
    EXPECT_EQ(record_.getInstanceID(), "id");
    EXPECT_EQ(record_.getElementName(), "element");
    EXPECT_FALSE(record_.setInstanceID(""));
    EXPECT_FALSE(record_.setElementName(""));
    EXPECT_EQ(record_.getInstanceID(), "") << "an empty value is assigned all the same";
    EXPECT_EQ(record_.getElementName(), "");
}

TEST_F(CapabilitiesRecord, The_list_getters_append_on_every_call) {
    EXPECT_THAT(record_.getOperationsSupported(), ElementsAre(2, 3, 4));
    EXPECT_THAT(record_.getRequestedStatesSupported(), ElementsAre(2, 3, 6));
    EXPECT_THAT(record_.getOperationsSupported(), ElementsAre(2, 3, 4, 2, 3, 4));
    EXPECT_THAT(record_.getRequestedStatesSupported(), ElementsAre(2, 3, 6, 2, 3, 6));
}

class CapabilitiesLoader : public Capabilities {
protected:
    ~CapabilitiesLoader() override { EXPECT_EQ(platform_.openCursors(), 0U); }

    // Loads; what goes to standard error is kept in told_.
    bool load() {
        testing::internal::CaptureStderr();
        const bool failed = getSimAccountManagementCapabilitiesInstances(records_);
        told_ = testing::internal::GetCapturedStderr();
        return failed;
    }

    std::vector<std::string> ids() {
        std::vector<std::string> all;
        for (SimAccountManagementCapabilities& record : records_) {
            all.push_back(record.getInstanceID());
        }
        return all;
    }

    std::vector<SimAccountManagementCapabilities> records_;
    std::string told_;
};

TEST_F(CapabilitiesLoader, Appends_one_record_per_node_in_store_order) {
    platform_.addNode(serviceNode("/b"));
    platform_.addNode(serviceNode("/a"));
    EXPECT_FALSE(load());
    EXPECT_THAT(ids(), ElementsAre(capabilitiesId("/b"), capabilitiesId("/a")));
    EXPECT_EQ(records_[0].getElementName(), capabilitiesId("/b"));
    EXPECT_EQ(told_, "");
}

TEST_F(CapabilitiesLoader, Only_the_path_of_each_node_is_read) {
    platform_.addNode(serviceNode("/a"));
    load();
    std::vector<std::string> texts = platform_.storeCallTexts();
    texts.erase(
        std::remove_if(texts.begin(), texts.end(),
                       [](const std::string& text) { return text.find("operator bool") == 0; }),
        texts.end());
    EXPECT_THAT(texts, ElementsAre("Instrumentation()", "selectNode(40)", "getPathToNode()->/a",
                                   "convertPathToString(/a)->node:/a", "operator++()",
                                   "~Instrumentation()"));
}

TEST_F(CapabilitiesLoader, Without_a_node_it_succeeds_unlike_the_services_loader) {
    EXPECT_FALSE(load());
    EXPECT_THAT(records_, IsEmpty());
    EXPECT_EQ(told_, "");
}

TEST_F(CapabilitiesLoader, A_failing_store_is_told_on_standard_error) {
    for (const char* operation : {"Instrumentation", "selectNode", "operator bool", "getPathToNode",
                                  "convertPathToString", "operator++"}) {
        platform_.reset();
        platform_.addNode(serviceNode("/a"));
        platform_.failOperation(operation, 1, StoreFault::ThrowsRuntimeError);
        EXPECT_TRUE(load()) << operation;
        EXPECT_EQ(told_, std::string(storeFailureText) + "\n") << operation;
        EXPECT_EQ(platform_.openCursors(), 0U) << operation;
    }
}

TEST_F(CapabilitiesLoader, What_is_no_exception_of_the_language_passes_on) {
    platform_.addNode(serviceNode("/a"));
    platform_.failOperation("getPathToNode", 1, StoreFault::ThrowsForeign);
    EXPECT_THROW(getSimAccountManagementCapabilitiesInstances(records_), ForeignFailure);
}

} // namespace
} // namespace qelo::test
