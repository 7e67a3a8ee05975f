#include "Scratch.h"

#include "logging/AdmissionCache.h"

#include <gtest/gtest.h>

#include <random>

namespace {

using namespace qelo::logging;
using namespace qelo::test;
using namespace std::chrono_literals;

class AdmissionCacheTest : public testing::Test {
protected:
    bool admitted(const std::string& component, int level, Channel channel = Channel::Log) {
        return isAdmitted(*core, cache, channel, component, level);
    }

    void configure(const std::string& text, LoggerCore::Clock::duration interval = 1h) {
        writeFile(config, "log = stderr\n" + text);
        core = std::make_unique<LoggerCore>(config, interval);
    }

    Scratch scratch;
    const std::string config = scratch.at("logging.conf");
    std::unique_ptr<LoggerCore> core;
    AdmissionCache cache{};
};

TEST_F(AdmissionCacheTest, A_level_at_the_threshold_is_admitted_and_one_below_is_not) {
    configure("log.level = 4000\n");
    for (int round = 0; round < 3; ++round) {
        EXPECT_TRUE(admitted("Corvane.A", 4000));
        EXPECT_FALSE(admitted("Corvane.A", 3999));
    }
}

TEST_F(AdmissionCacheTest, Off_turns_away_the_highest_level_and_0_admits_all_but_negative_ones) {
    configure("log.level.a = off\nlog.level.b = 0\n");
    EXPECT_FALSE(admitted("a", INT32_MAX));
    EXPECT_TRUE(admitted("b", 0));
    EXPECT_FALSE(admitted("b", -1));
}

TEST_F(AdmissionCacheTest, Log_and_trace_are_told_apart) {
    configure("trace = stderr\ntrace.level = 5000\nlog.level = 6000\n");
    EXPECT_FALSE(admitted("a", 5500, Channel::Log));
    EXPECT_TRUE(admitted("a", 5500, Channel::Trace));
    EXPECT_FALSE(admitted("a", 5500, Channel::Log));
}

TEST_F(AdmissionCacheTest, The_characters_of_a_component_decide_not_its_address) {
    configure("log.level.aaaa = 1\nlog.level.bbbb = 2\n");
    std::string component = "aaaa";
    EXPECT_TRUE(admitted(component, 1));
    component = "bbbb";
    EXPECT_FALSE(admitted(component, 1));
    component = "aaaa";
    EXPECT_TRUE(admitted(component, 1));
}

TEST_F(AdmissionCacheTest, Names_of_any_length_and_content_are_answered_rightly) {
    configure("log.level = 10\nlog.level.a = 5\n");
    EXPECT_FALSE(admitted("", 7));
    EXPECT_TRUE(admitted("a." + std::string(1000, 'x'), 7));
    EXPECT_FALSE(admitted("b." + std::string(1000, 'x'), 7));
    EXPECT_TRUE(admitted(std::string("a.\0x", 4), 7));
    EXPECT_FALSE(admitted(std::string("a\0x", 3), 7));
}

TEST_F(AdmissionCacheTest, Many_components_at_once_get_their_own_answers) {
    std::string text;
    std::vector<std::string> components;
    for (int index = 0; index < 500; ++index) {
        components.push_back("Corvane.Component" + std::to_string(index));
        text += "log.level." + components.back() + " = " + std::to_string(index) + "\n";
    }
    configure(text);
    std::mt19937 random(3); // NOLINT(cert-msc32-c,cert-msc51-cpp): the same each time
    for (int round = 0; round < 20000; ++round) {
        const int index = static_cast<int>(random() % components.size());
        const auto& component = components[static_cast<std::size_t>(index)];
        ASSERT_TRUE(admitted(component, index));
        ASSERT_FALSE(admitted(component, index - 1));
    }
}

TEST_F(AdmissionCacheTest, A_changed_configuration_reaches_components_that_are_turned_away) {
    configure("log.level = off\n", 0s);
    EXPECT_FALSE(admitted("a", 100));
    writeFile(config, "log = stderr\nlog.level = 100\n");
    unsigned turnedAway = 0;
    while (turnedAway < 1000 && !admitted("a", 100)) {
        ++turnedAway;
    }
    EXPECT_LE(turnedAway, AdmissionCache::kLinesPerCheck + 1);
}

} // namespace
