#include <cim/DateTime.h>

#include <gtest/gtest.h>

#include <ctime>

namespace qelo::cim {
namespace {

constexpr std::uint64_t kSecond = 1000000;

std::uint64_t microsecondsOf(const char* text) {
    const auto value = DateTime::parse(text);
    EXPECT_TRUE(value) << text;
    return value ? value->microseconds() : 0;
}

TEST(DateTime, The_text_of_a_parsed_value_is_what_was_read) {
    for (const char* text : {"20140307123005.000000+000", "19980525133015.123456-300",
                             "00000031235959.999999:000", "20140307******.******+000"}) {
        const auto value = DateTime::parse(text);
        ASSERT_TRUE(value) << text;
        EXPECT_EQ(value->text(), text);
    }
}

TEST(DateTime, The_separator_tells_an_interval_from_a_point_in_time) {
    EXPECT_TRUE(DateTime::parse("00000001000000.000000:000")->isInterval());
    EXPECT_FALSE(DateTime::parse("20000101000000.000000+000")->isInterval());
}

TEST(DateTime, A_point_in_time_counts_from_1970) {
    EXPECT_EQ(microsecondsOf("19700101000000.000000+000"), 0U);
    EXPECT_EQ(microsecondsOf("19700101000001.000002+000"), kSecond + 2);
    EXPECT_EQ(microsecondsOf("20140307123005.000000+000"), 1394195405UL * kSecond);
    EXPECT_EQ(microsecondsOf("20000229000000.000000+000"), 951782400U * kSecond);
}

TEST(DateTime, The_offset_is_that_of_the_place_so_it_is_taken_off) {
    EXPECT_EQ(microsecondsOf("19700101010000.000000+060"), 0U);
    EXPECT_EQ(microsecondsOf("19700101000000.000000-060"), 3600U * kSecond);
}

TEST(DateTime, Times_before_1970_count_as_zero) {
    EXPECT_EQ(microsecondsOf("19691231235959.999999+000"), 0U);
    EXPECT_EQ(microsecondsOf("19700101000000.000000+001"), 0U);
    EXPECT_EQ(microsecondsOf("00000101000000.000000+000"), 0U);
}

TEST(DateTime, An_interval_counts_its_length) {
    EXPECT_EQ(microsecondsOf("00000001020304.000005:000"), (86400U + 7384U) * kSecond + 5);
    EXPECT_EQ(microsecondsOf("99999999235959.999999:000"), (100000000ULL * 86400ULL) * kSecond - 1);
}

TEST(DateTime, Asterisks_count_as_the_lowest_value) {
    EXPECT_EQ(microsecondsOf("2014**********.******+000"), 1388534400UL * kSecond);
    EXPECT_EQ(microsecondsOf("20140307123005.12****+000"), 1394195405UL * kSecond + 120000);
    EXPECT_EQ(microsecondsOf("00000002******.******:000"), 2UL * 86400UL * kSecond);
}

TEST(DateTime, Asterisks_cover_whole_fields_from_the_right_only) {
    EXPECT_TRUE(DateTime::parse("**************.******+000"));
    EXPECT_TRUE(DateTime::parse("**************.******:000"));
    EXPECT_TRUE(DateTime::parse("20140307123005.*****"
                                "*+000"));
    for (const char* text :
         {"201*0307123005.000000+000", "2014030712300*.******+000", "20140307**3005.000000+000",
          "201403071230**.000000+000", "20140307123005.0*0000+000", "20140307123005.*00000+000",
          "20140307123005.000000+***", "0000000*000000.000000:000", "00000001**0000.000000:000",
          "00000001000000.000000:***"}) {
        EXPECT_FALSE(DateTime::parse(text)) << text;
    }
}

TEST(DateTime, Impossible_dates_and_times_are_refused) {
    for (const char* text :
         {"20141301000000.000000+000", "20140001000000.000000+000", "20140100000000.000000+000",
          "20140431000000.000000+000", "20140229000000.000000+000", "19000229000000.000000+000",
          "20140307240000.000000+000", "20140307126000.000000+000", "20140307123060.000000+000",
          "00000001240000.000000:000", "00000001006000.000000:000", "00000001000060.000000:000"}) {
        EXPECT_FALSE(DateTime::parse(text)) << text;
    }
}

TEST(DateTime, Leap_days_exist_in_leap_years) {
    EXPECT_TRUE(DateTime::parse("20000229000000.000000+000"));
    EXPECT_TRUE(DateTime::parse("20240229000000.000000+000"));
}

TEST(DateTime, Texts_of_another_shape_are_refused) {
    for (const char* text :
         {"", "20140307123005", "20140307123005.000000+00", "20140307123005.000000+0000",
          "20140307123005,000000+000", "20140307123005.000000 000", "20140307123005.000000+00x",
          "20140307123005.000000+-00", "2014-03-07 12:30:05.000000", " 0140307123005.000000+000",
          "20140307123005.000000:000x", "20140307123005.000000+ 00", "+0140307123005.000000+000",
          "00000001000000.000000:001"}) {
        EXPECT_FALSE(DateTime::parse(text)) << text;
    }
}

TEST(DateTime, A_zero_byte_inside_is_refused) {
    EXPECT_FALSE(DateTime::parse(std::string_view("20140307123005.000000+00\0", 25)));
}

TEST(DateTime, Microseconds_become_text_and_come_back) {
    for (const std::uint64_t micros :
         {std::uint64_t{0}, std::uint64_t{1}, 951782399U * kSecond + 999999, 951782400U * kSecond,
          1394195405UL * kSecond + 42, 253402300799U * kSecond + 999999}) {
        EXPECT_EQ(DateTime::fromMicroseconds(micros, false).microseconds(), micros);
        EXPECT_EQ(DateTime::fromMicroseconds(micros, true).microseconds(), micros);
    }
    EXPECT_EQ(DateTime::fromMicroseconds(1394195405UL * kSecond + 42, false).text(),
              "20140307123005.000042+000");
    EXPECT_EQ(DateTime::fromMicroseconds(93784U * kSecond + 5, true).text(),
              "00000001020304.000005:000");
}

TEST(DateTime, What_does_not_fit_becomes_the_largest_value) {
    EXPECT_EQ(DateTime::fromMicroseconds(UINT64_MAX, false).text(), "99991231235959.999999+000");
    EXPECT_EQ(DateTime::fromMicroseconds(UINT64_MAX, true).text(), "99999999235959.999999:000");
}

TEST(DateTime, Now_is_the_time_of_the_system_clock) {
    const auto before = static_cast<std::uint64_t>(std::time(nullptr)) * kSecond;
    const DateTime now = DateTime::now();
    EXPECT_FALSE(now.isInterval());
    EXPECT_GE(now.microseconds(), before);
    EXPECT_LE(now.microseconds(), before + 60 * kSecond);
    EXPECT_EQ(DateTime::parse(now.text()), now);
}

} // namespace
} // namespace qelo::cim
