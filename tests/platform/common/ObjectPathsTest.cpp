#include "FakePath.h"

#include "platform/TeskCommon.h"

#include <gtest/gtest.h>

namespace {

using namespace qelo::test;
using Tesk::isObjPathsEqual;

class ObjectPaths : public testing::Test {
protected:
    ~ObjectPaths() override { Faults::none(); }

    static bool equal(const FakePath& wanted, const FakePath& path, bool strict = false) {
        return isObjPathsEqual(wanted.get(), path.get(), strict);
    }

    // Whether two paths are equal that differ in the type and value of their one key.
    static bool equalKeys(CMPIType leftType, CMPIValue left, CMPIType rightType, CMPIValue right) {
        FakePath wanted("C");
        FakePath path("C");
        wanted.add("K", leftType, left);
        path.add("K", rightType, right);
        const bool forward = equal(wanted, path);
        EXPECT_EQ(forward, equal(path, wanted));
        return forward;
    }
};

template <typename Number> CMPIValue valueOf(Number CMPIValue::*member, Number number) {
    CMPIValue value{};
    value.*member = number;
    return value;
}

CMPIValue unsigned64(CMPIUint64 number) { return valueOf(&CMPIValue::uint64, number); }

TEST_F(ObjectPaths, Class_names_are_compared_ignoring_case) {
    EXPECT_TRUE(equal(FakePath("ZANTH_Account"), FakePath("zanth_ACCOUNT")));
    EXPECT_FALSE(equal(FakePath("ZANTH_Account"), FakePath("ZANTH_Accounts")));
    EXPECT_FALSE(equal(FakePath("ZANTH_Account"), FakePath("ZANTH_Group")));
    EXPECT_FALSE(equal(FakePath("A@"), FakePath("A`")));
}

TEST_F(ObjectPaths, Text_keys_are_compared_exactly) {
    FakePath wanted("C");
    wanted.addText("Name", "root");
    EXPECT_TRUE(equal(wanted, FakePath("C").addText("Name", "root")));
    EXPECT_FALSE(equal(wanted, FakePath("C").addText("Name", "Root")));
    EXPECT_FALSE(equal(wanted, FakePath("C").addText("Name", "root ")));
    EXPECT_FALSE(equal(wanted, FakePath("C").addText("Name", "")));
}

TEST_F(ObjectPaths, Key_names_are_looked_up_ignoring_case) {
    EXPECT_TRUE(equal(FakePath("C").addText("name", "x"), FakePath("C").addText("NAME", "x")));
}

TEST_F(ObjectPaths, Every_wanted_key_must_be_in_the_path) {
    FakePath wanted("C");
    wanted.addText("A", "1").addText("B", "2");
    EXPECT_FALSE(equal(wanted, FakePath("C").addText("A", "1")));
    EXPECT_TRUE(equal(wanted, FakePath("C").addText("B", "2").addText("A", "1")));
    EXPECT_FALSE(equal(wanted, FakePath("C").addText("A", "1").addText("B", "3")));
}

TEST_F(ObjectPaths, More_keys_in_the_path_matter_only_to_the_strict_comparison) {
    FakePath wanted("C");
    wanted.addText("A", "1");
    FakePath path("C");
    path.addText("A", "1").addText("B", "2");
    EXPECT_TRUE(equal(wanted, path, false));
    EXPECT_FALSE(equal(wanted, path, true));
    EXPECT_TRUE(equal(wanted, FakePath("C").addText("A", "1"), true));
}

TEST_F(ObjectPaths, Without_keys_the_class_alone_decides) {
    EXPECT_TRUE(equal(FakePath("C"), FakePath("C").addText("A", "1")));
    EXPECT_TRUE(equal(FakePath("C"), FakePath("C"), true));
}

TEST_F(ObjectPaths, Both_forms_of_a_text_are_alike) {
    char characters[] = "root";
    CMPIValue value{};
    value.chars = characters;
    FakePath wanted("C");
    wanted.add("Name", CMPI_chars, value);
    EXPECT_TRUE(equal(wanted, FakePath("C").addText("Name", "root")));
    EXPECT_TRUE(equal(FakePath("C").addText("Name", "root"), wanted));
    value.chars = nullptr;
    EXPECT_FALSE(equal(wanted, FakePath("C").add("Name", CMPI_chars, value)));
}

TEST_F(ObjectPaths, Integers_of_all_widths_are_compared_by_value) {
    const std::vector<std::pair<CMPIType, CMPIValue>> sevens = {
        {CMPI_uint8, valueOf<CMPIUint8>(&CMPIValue::uint8, 7)},
        {CMPI_uint16, valueOf<CMPIUint16>(&CMPIValue::uint16, 7)},
        {CMPI_uint32, valueOf<CMPIUint32>(&CMPIValue::uint32, 7)},
        {CMPI_uint64, valueOf<CMPIUint64>(&CMPIValue::uint64, 7)},
        {CMPI_sint8, valueOf<CMPISint8>(&CMPIValue::sint8, 7)},
        {CMPI_sint16, valueOf<CMPISint16>(&CMPIValue::sint16, 7)},
        {CMPI_sint32, valueOf<CMPISint32>(&CMPIValue::sint32, 7)},
        {CMPI_sint64, valueOf<CMPISint64>(&CMPIValue::sint64, 7)}};
    for (const auto& [leftType, left] : sevens) {
        EXPECT_FALSE(equalKeys(leftType, left, CMPI_uint64, unsigned64(8)));
        for (const auto& [rightType, right] : sevens) {
            EXPECT_TRUE(equalKeys(leftType, left, rightType, right)) << leftType << rightType;
        }
    }
}

TEST_F(ObjectPaths, Only_the_width_of_its_type_counts_of_an_integer) {
    CMPIValue value = unsigned64(0xFFFFFFFFFFFFFF07ULL);
    EXPECT_TRUE(equalKeys(CMPI_uint8, value, CMPI_uint64, unsigned64(7)));
}

TEST_F(ObjectPaths, A_negative_number_is_not_the_large_one_of_the_same_bits) {
    const CMPIValue minusOne = valueOf<CMPISint64>(&CMPIValue::sint64, -1);
    EXPECT_FALSE(equalKeys(CMPI_sint64, minusOne, CMPI_uint64, unsigned64(UINT64_MAX)));
    EXPECT_TRUE(
        equalKeys(CMPI_sint64, minusOne, CMPI_sint8, valueOf<CMPISint8>(&CMPIValue::sint8, -1)));
}

TEST_F(ObjectPaths, Flags_are_compared_by_their_truth) {
    const CMPIValue one = valueOf<CMPIBoolean>(&CMPIValue::boolean, 1);
    const CMPIValue two = valueOf<CMPIBoolean>(&CMPIValue::boolean, 2);
    EXPECT_TRUE(equalKeys(CMPI_boolean, one, CMPI_boolean, two));
    EXPECT_FALSE(equalKeys(CMPI_boolean, one, CMPI_boolean, CMPIValue{}));
}

TEST_F(ObjectPaths, Real_numbers_and_characters_are_compared_by_value) {
    const CMPIValue half32 = valueOf<CMPIReal32>(&CMPIValue::real32, 0.5F);
    const CMPIValue half64 = valueOf<CMPIReal64>(&CMPIValue::real64, 0.5);
    EXPECT_TRUE(equalKeys(CMPI_real32, half32, CMPI_real64, half64));
    EXPECT_FALSE(equalKeys(CMPI_real64, half64, CMPI_real64, CMPIValue{}));
    const CMPIValue letter = valueOf<CMPIChar16>(&CMPIValue::char16, 'a');
    EXPECT_TRUE(equalKeys(CMPI_char16, letter, CMPI_char16, letter));
    EXPECT_FALSE(equalKeys(CMPI_char16, letter, CMPI_char16, CMPIValue{}));
}

TEST_F(ObjectPaths, Dates_are_compared_by_their_text) {
    FakePath wanted("C");
    wanted.addDate("When", "20240102030405.000000+000");
    EXPECT_TRUE(equal(wanted, FakePath("C").addDate("When", "20240102030405.000000+000")));
    EXPECT_FALSE(equal(wanted, FakePath("C").addDate("When", "20240102030406.000000+000")));
}

TEST_F(ObjectPaths, Values_of_different_kinds_are_never_equal) {
    FakePath text("C");
    text.addText("K", "1");
    FakePath number("C");
    number.add("K", CMPI_uint64, unsigned64(1));
    FakePath flag("C");
    flag.add("K", CMPI_boolean, valueOf<CMPIBoolean>(&CMPIValue::boolean, 1));
    FakePath date("C");
    date.addDate("K", "1");
    FakePath reference("C");
    reference.addReference("K", text);
    const FakePath* paths[] = {&text, &number, &flag, &date, &reference};
    for (const FakePath* left : paths) {
        for (const FakePath* right : paths) {
            EXPECT_EQ(equal(*left, *right), left == right);
        }
    }
}

TEST_F(ObjectPaths, A_null_value_equals_only_a_null_value) {
    FakePath null("C");
    null.add("K", CMPI_string, CMPIValue{}, CMPI_keyValue | CMPI_nullValue);
    EXPECT_FALSE(equal(null, FakePath("C").addText("K", "")));
    EXPECT_FALSE(equal(FakePath("C").addText("K", ""), null));
    EXPECT_FALSE(equal(null, FakePath("C")));
    EXPECT_TRUE(equal(null, null));
}

TEST_F(ObjectPaths, Keys_of_types_that_cannot_be_compared_are_not_equal) {
    EXPECT_FALSE(equalKeys(CMPI_instance, CMPIValue{}, CMPI_instance, CMPIValue{}));
    EXPECT_FALSE(equalKeys(CMPI_stringA, CMPIValue{}, CMPI_stringA, CMPIValue{}));
}

TEST_F(ObjectPaths, References_are_compared_by_the_same_rule) {
    FakePath target("S");
    target.addText("Name", "x");
    FakePath same("s");
    same.addText("name", "x");
    FakePath more("S");
    more.addText("Name", "x").addText("Other", "y");
    FakePath different("S");
    different.addText("Name", "y");
    FakePath wanted("A");
    wanted.addReference("Element", target);
    EXPECT_TRUE(equal(wanted, FakePath("A").addReference("Element", same)));
    EXPECT_FALSE(equal(wanted, FakePath("A").addReference("Element", different)));
    EXPECT_TRUE(equal(wanted, FakePath("A").addReference("Element", more), false));
    EXPECT_FALSE(equal(wanted, FakePath("A").addReference("Element", more), true));
}

TEST_F(ObjectPaths, References_are_followed_to_a_depth_and_not_beyond) {
    std::deque<FakePath> chain;
    chain.emplace_back("C").addText("Name", "end");
    for (int depth = 0; depth < 8; ++depth) {
        const FakePath& target = chain.back();
        chain.emplace_back("C").addReference("Next", target);
    }
    EXPECT_TRUE(equal(chain.back(), chain.back()));
    const FakePath& target = chain.back();
    chain.emplace_back("C").addReference("Next", target);
    EXPECT_FALSE(equal(chain.back(), chain.back()));
}

TEST_F(ObjectPaths, A_path_that_refers_to_itself_ends_the_comparison) {
    FakePath path("C");
    path.addReference("Self", path);
    EXPECT_FALSE(equal(path, path));
}

TEST_F(ObjectPaths, A_null_or_dead_path_equals_nothing) {
    FakePath path("C");
    EXPECT_FALSE(isObjPathsEqual(nullptr, path.get(), false));
    EXPECT_FALSE(isObjPathsEqual(path.get(), nullptr, false));
    EXPECT_FALSE(isObjPathsEqual(nullptr, nullptr, true));
    FakePath dead("C");
    dead.object().hdl = nullptr;
    EXPECT_FALSE(equal(dead, path));
    EXPECT_FALSE(equal(path, dead));
    FakePath tableless("C");
    tableless.object().ft = nullptr;
    EXPECT_FALSE(equal(tableless, path));
    EXPECT_FALSE(equal(path, tableless));
    const CMPIObjectPathFT empty{};
    FakePath slotless("C");
    slotless.object().ft = &empty;
    EXPECT_FALSE(equal(slotless, slotless));
    FakePath reference("C");
    reference.addReference("Dead", dead);
    EXPECT_FALSE(equal(reference, reference));
}

TEST_F(ObjectPaths, A_failure_at_any_call_makes_the_paths_unequal) {
    FakePath target("S");
    target.addText("Name", "x");
    FakePath path("C");
    path.addText("A", "1").addDate("B", "2").addReference("C", target);
    Faults::none();
    ASSERT_TRUE(equal(path, path, true));
    const int calls = Faults::calls();
    ASSERT_GT(calls, 20);
    for (const Fault fault :
         {Fault::NullResult, Fault::DeadHandle, Fault::FailureStatus, Fault::MissingSlot}) {
        for (int call = 1; call <= calls; ++call) {
            Faults::arm(fault, call);
            EXPECT_FALSE(equal(path, path, true)) << "call " << call;
        }
    }
    Faults::none();
    EXPECT_TRUE(equal(path, path, true));
}

} // namespace
