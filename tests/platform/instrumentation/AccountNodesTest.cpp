#include "AccountNodes.h"

#include <gtest/gtest.h>

#include <limits>

namespace qelo::nodes::tests {

namespace {

constexpr long today = 20000;

ShadowRecord shadowWith(const char* field, long expiry = -1) {
    ShadowRecord record;
    if (passwordUse(field) == PasswordUse::locked) {
        record.password = PasswordUse::locked;
    }
    record.expiry = expiry;
    return record;
}

std::optional<unsigned int> stateOf(const char* shadowField, long expiry = -1) {
    const ShadowRecord record = shadowWith(shadowField, expiry);
    return accountState(PasswordUse::elsewhere, &record, today);
}

} // namespace

TEST(AccountState, Is_locked_for_a_field_that_starts_with_an_exclamation_mark_or_asterisk) {
    for (const char* field : {"!", "!!", "*", "!*", "*!", "!$6$salt$hash", "*LK*", "!x"}) {
        EXPECT_EQ(stateOf(field), 16U) << field;
    }
}

TEST(AccountState, Is_usable_for_a_hash_and_where_no_password_is_needed) {
    for (const char* field : {"", "$6$salt$hash", "$y$j9T$s$h", "ab01FAX.bQRSU", "x"}) {
        EXPECT_EQ(stateOf(field), 1U) << field;
    }
}

TEST(AccountState, Is_expired_from_the_day_of_expiry_on) {
    EXPECT_EQ(stateOf("$6$h", today + 1), 1U);
    EXPECT_EQ(stateOf("$6$h", today), 12U);
    EXPECT_EQ(stateOf("$6$h", today - 1), 12U);
    EXPECT_EQ(stateOf("$6$h", 0), 12U);
    EXPECT_EQ(stateOf("$6$h", -1), 1U);
}

TEST(AccountState, Of_a_locked_account_that_is_expired_too_is_locked) {
    EXPECT_EQ(stateOf("!$6$h", today - 1), 16U);
}

TEST(AccountState, Comes_from_the_account_file_where_that_has_the_password_field) {
    EXPECT_EQ(accountState(passwordUse("*"), nullptr, today), 16U);
    EXPECT_EQ(accountState(passwordUse("$6$h"), nullptr, today), 1U);
    EXPECT_EQ(accountState(passwordUse(""), nullptr, today), 1U);
    const ShadowRecord locked = shadowWith("!");
    EXPECT_EQ(accountState(passwordUse("$6$h"), &locked, today), 1U);
}

TEST(AccountState, Is_not_told_without_a_shadow_record) {
    EXPECT_EQ(accountState(passwordUse("x"), nullptr, today), std::nullopt);
}

TEST(DayText, Is_the_start_of_the_day_in_utc) {
    EXPECT_EQ(dayText(0), "1970-01-01 00:00:00");
    EXPECT_EQ(dayText(19782), "2024-02-29 00:00:00");
    EXPECT_EQ(dayText(2'932'896), "9999-12-31 00:00:00");
}

TEST(DayText, Is_not_told_for_days_without_a_date) {
    EXPECT_EQ(dayText(-1), std::nullopt);
    EXPECT_EQ(dayText(2'932'897), std::nullopt);
    EXPECT_EQ(dayText(std::numeric_limits<long>::max()), std::nullopt);
    EXPECT_EQ(dayText(std::numeric_limits<long>::min()), std::nullopt);
}

} // namespace qelo::nodes::tests
