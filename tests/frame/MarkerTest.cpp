// The markers around a provider operation, and the pairs of lines that every point emits.
#include "support/platform/RecordingPlatform.h"
#include "support/platform/TracePoints.h"

#include <Trace.h>

#include <gtest/gtest.h>

#include <string>

namespace qelo::test {
namespace {

class Marker : public testing::Test {
protected:
    void SetUp() override { RecordingPlatform::instance().reset(); }
    static std::vector<LogLine> lines() { return RecordingPlatform::instance().lines(); }

    const std::string component_ = "Corvane.Sample";
    const std::string banner_ = std::string(78, '=');
};

TEST_F(Marker, Entry_is_a_banner_and_an_ENTERING_line_each_to_the_log_then_to_the_trace) {
    Tesk::markProviderEntry(component_, "Work", "SampleProvider", 12);
    const std::vector<LogLine> recorded = lines();
    ASSERT_EQ(recorded.size(), 4U);
    const std::string entering = "ENTERING: Work() in SampleProvider [Line: 12]";
    const std::string messages[] = {banner_, banner_, entering, entering};
    for (std::size_t i = 0; i < 4; ++i) {
        EXPECT_EQ(recorded[i].sink, i % 2 == 0 ? Sink::Log : Sink::Trace);
        EXPECT_EQ(recorded[i].message, messages[i]);
        EXPECT_EQ(recorded[i].function, "markProviderEntry");
        EXPECT_EQ(recorded[i].file, "Trace");
        EXPECT_EQ(recorded[i].component, component_);
        EXPECT_EQ(recorded[i].level, 4000);
        EXPECT_EQ(recorded[i].reserved1, nullptr);
        EXPECT_EQ(recorded[i].reserved2, 0);
        EXPECT_EQ(recorded[i].reserved3, 0);
    }
}

TEST_F(Marker, Exit_is_an_EXITING_line_and_a_banner_in_mirror_order) {
    Tesk::markProviderExit(component_, "Work", "SampleProvider", 12);
    const std::vector<LogLine> recorded = lines();
    ASSERT_EQ(recorded.size(), 4U);
    const std::string exiting = "EXITING: Work() in SampleProvider [Line: 12]";
    const std::string messages[] = {exiting, exiting, banner_, banner_};
    for (std::size_t i = 0; i < 4; ++i) {
        EXPECT_EQ(recorded[i].sink, i % 2 == 0 ? Sink::Log : Sink::Trace);
        EXPECT_EQ(recorded[i].message, messages[i]);
        EXPECT_EQ(recorded[i].function, "markProviderExit");
        EXPECT_EQ(recorded[i].file, "Trace");
        EXPECT_EQ(recorded[i].component, component_);
        EXPECT_EQ(recorded[i].level, 4000);
        EXPECT_EQ(recorded[i].reserved1, nullptr);
        EXPECT_EQ(recorded[i].reserved2, 0);
        EXPECT_EQ(recorded[i].reserved3, 0);
    }
}

TEST_F(Marker, A_marker_overwrites_the_text_that_a_caller_holds_from_trace) {
    const char* held = Tesk::trace("mine", "Unit", 1, Tesk::METHOD);
    Tesk::markProviderEntry(component_, "Work", "SampleProvider", 12);
    EXPECT_STREQ(held, "ENTERING: Work() in SampleProvider [Line: 12]");
    Tesk::markProviderExit(component_, "Work", "SampleProvider", 12);
    EXPECT_STREQ(held, "EXITING: Work() in SampleProvider [Line: 12]");
}

} // namespace
} // namespace qelo::test
