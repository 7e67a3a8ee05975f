#include "support/broker/DateTimeText.h"

#include "support/broker/RecordingBroker.h"

#include <cmpimacs.h>

#include <gtest/gtest.h>

namespace qelo::test {

namespace {

TEST(DateTimeText, Both_forms_are_accepted) {
    for (const char* text :
         {"20240229235959.123456+060", "19700101000000.000000-000", "00000000000000.000000:000",
          "99999999235959.999999:000", "20240101******.******+000", "****0101000000.000000+000",
          "20240101000000.123***+000", "20240101000000.000000+720"}) {
        EXPECT_TRUE(isDateTimeText(text)) << text;
    }
}

TEST(DateTimeText, Everything_else_is_refused) {
    for (const char* text :
         {"", "x", "20240101000000.000000+00", "20240101000000.000000+0000",
          "20241301000000.000000+000", "20240001000000.000000+000", "20240230000000.000000+000",
          "20240100000000.000000+000", "20240101240000.000000+000", "20240101006000.000000+000",
          "20240101000060.000000+000", "20240101000000,000000+000", "20240101000000.000000 000",
          "20240101000000.00000a+000", "20240101000000.**0000+000", "2024010100000*.000000+000",
          "00000000000000.000000:001", "00000000000000.000000:0 0", "2024-01-01T00:00:00.00000"}) {
        EXPECT_FALSE(isDateTimeText(text)) << text;
    }
}

TEST(DateTimeText, The_binary_form_is_in_UTC) {
    EXPECT_EQ(binaryOfDateTimeText("19700101000000.000000+000"), 0u);
    EXPECT_EQ(binaryOfDateTimeText("20000229120000.000001+060"), 951822000000001u);
    EXPECT_EQ(binaryOfDateTimeText("20000229120000.000001-060"), 951829200000001u);
    EXPECT_EQ(binaryOfDateTimeText("00000001010203.000004:000"), 90123000004u);
}

TEST(DateTimeText, The_binary_form_becomes_text_again) {
    EXPECT_EQ(dateTimeTextOf(951822000000001, false), "20000229110000.000001+000");
    EXPECT_EQ(dateTimeTextOf(90123000004, true), "00000001010203.000004:000");
}

TEST(DateTimeText, Objects_answer_in_both_forms) {
    RecordingBroker broker;
    const CMPIDateTime* const date =
        CMNewDateTimeFromBinary(broker.get(), 951822000000001, 0, nullptr);
    EXPECT_STREQ(CMGetCharPtr(CMGetStringFormat(date, nullptr)), "20000229110000.000001+000");
    EXPECT_EQ(CMGetBinaryFormat(date, nullptr), 951822000000001u);
    EXPECT_FALSE(CMIsInterval(date, nullptr));
    const CMPIDateTime* const interval = CMNewDateTimeFromBinary(broker.get(), 1000000, 1, nullptr);
    EXPECT_TRUE(CMIsInterval(interval, nullptr));
    const CMPIDateTime* const now = CMNewDateTime(broker.get(), nullptr);
    EXPECT_GT(CMGetBinaryFormat(now, nullptr), 1700000000000000u);
    EXPECT_TRUE(broker.violations().empty());
}

} // namespace

} // namespace qelo::test
