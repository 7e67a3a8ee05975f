// The layout, the types and the constants of the CMPI headers, as C++17 and as C11 see them.

#include "cmpi/Abi.h"

#include <cmpi/cmpift.h>
#include <cmpidt.h>

#include <gtest/gtest.h>

#include <string>
#include <type_traits>
#include <vector>

namespace {

const std::vector<AbiFact>& factsOfCpp() {
    static const std::vector<AbiFact> facts = {
#define SIZE(type, size, alignment)                                                                \
    {"size of " #type, size, sizeof(type)}, {"alignment of " #type, alignment, alignof(type)},
#define MEMBER(type, offset, member, ...)                                                          \
    {"offset of " #type "." #member, offset, offsetof(type, member)},                              \
        {"type of " #type "." #member, 1, std::is_same_v<decltype(type::member), __VA_ARGS__>},
#include "cmpi/AbiSizes.inc"
#define SCALAR(name, type) {"type behind " #name, 1, std::is_same_v<name, type>},
#include "cmpi/AbiScalars.inc"
#define DATA(table, offset, member, memberType) MEMBER(table, offset, member, memberType)
#define SLOT(table, offset, member, result, arguments)                                             \
    MEMBER(table, offset, member, result(*) arguments)
#include "cmpi/AbiSlots.inc"
#define CONSTANT(name, value) {#name, value, static_cast<unsigned long long>(name)},
#include "cmpi/AbiConstants.inc"
    };
    return facts;
}

template <typename Facts> std::vector<std::string> mismatches(const Facts& begin, std::size_t n) {
    std::vector<std::string> result;
    for (std::size_t i = 0; i < n; ++i) {
        if (begin[i].expected != begin[i].actual) {
            result.push_back(std::string(begin[i].what) + ": " + std::to_string(begin[i].actual) +
                             " instead of " + std::to_string(begin[i].expected));
        }
    }
    return result;
}

// Sizes, offsets and types of about 300 members, and more than 300 constants.
constexpr std::size_t factsExpected = 1000;

TEST(CmpiAbi, Sizes_offsets_types_and_constants_are_those_of_CMPI_2_0_in_Cpp) {
    EXPECT_GT(factsOfCpp().size(), factsExpected);
    EXPECT_EQ(mismatches(factsOfCpp(), factsOfCpp().size()), std::vector<std::string>{});
}

TEST(CmpiAbi, Sizes_offsets_types_and_constants_are_those_of_CMPI_2_0_in_C) {
    const AbiFacts facts = abiFactsOfC();
    EXPECT_EQ(facts.count, factsOfCpp().size());
    EXPECT_EQ(mismatches(facts.facts, facts.count), std::vector<std::string>{});
}

TEST(CmpiAbi, The_tables_have_no_gaps_and_no_members_beyond_the_listed_ones) {
    // Their sizes are tested above, so nothing can hide behind the last member either.
    std::size_t end = 0;
    std::string last;
#define DATA(table, offset, member, memberType)                                                    \
    EXPECT_TRUE(offset == 0 || offset == end) << #table "." #member << " after " << last;          \
    end = offset + sizeof(table::member);                                                          \
    end = (end + 3) / 4 * 4;                                                                       \
    last = #table "." #member;
#define SLOT(table, offset, member, result, arguments)                                             \
    EXPECT_EQ(std::size_t{offset}, (end + 7) / 8 * 8) << #table "." #member << " after " << last;  \
    end = offset + sizeof(table::member);                                                          \
    last = #table "." #member;
#include "cmpi/AbiSlots.inc"
}

TEST(CmpiAbi, The_first_member_of_a_value_is_its_64_bit_one) {
    const CMPIValue value = {0x0102030405060708ULL};
    EXPECT_EQ(value.uint64, 0x0102030405060708ULL);
}

TEST(CmpiAbi, Context_entries_are_named_as_their_macros) {
    EXPECT_STREQ(CMPIInitNameSpace, "CMPIInitNameSpace");
    EXPECT_STREQ(CMPIInvocationFlags, "CMPIInvocationFlags");
    EXPECT_STREQ(CMPIPrincipal, "CMPIPrincipal");
    EXPECT_STREQ(CMPIRole, "CMPIRole");
    EXPECT_STREQ(CMPIAcceptLanguage, "CMPIAcceptLanguage");
    EXPECT_STREQ(CMPIContentLanguage, "CMPIContentLanguage");
}

TEST(CmpiAbi, Struct_tags_are_the_type_names_with_an_underscore) {
    EXPECT_TRUE((std::is_same_v<struct _CMPIBroker, CMPIBroker>));
    EXPECT_TRUE((std::is_same_v<union _CMPIValue, CMPIValue>));
    EXPECT_TRUE((std::is_same_v<struct _CMPIData, CMPIData>));
    EXPECT_TRUE((std::is_same_v<struct _CMPIStatus, CMPIStatus>));
    EXPECT_TRUE((std::is_same_v<enum _CMPIrc, CMPIrc>));
    EXPECT_TRUE((std::is_same_v<struct _CMPIObjectPathFT, CMPIObjectPathFT>));
}

TEST(CmpiAbi, An_accessor_is_a_function_type_and_a_mark_is_opaque) {
    EXPECT_TRUE((std::is_same_v<CMPIAccessor, CMPIData(const char*, void*)>));
    EXPECT_TRUE((std::is_same_v<CMPIGcStat, void>));
    EXPECT_TRUE((std::is_same_v<CMPI_THREAD_TYPE, void*>));
    EXPECT_TRUE((std::is_same_v<CMPI_MUTEX_TYPE, void*>));
    EXPECT_TRUE((std::is_same_v<CMPI_COND_TYPE, void*>));
    EXPECT_TRUE((std::is_same_v<CMPI_THREAD_RETURN, void*>));
    EXPECT_TRUE((std::is_same_v<CMPI_THREAD_KEY_TYPE, unsigned int>));
}

#if !defined(CMPI_VER_80) || !defined(CMPI_VER_85) || !defined(CMPI_VER_86) ||                     \
    !defined(CMPI_VER_87) || !defined(CMPI_VER_90) || !defined(CMPI_VER_100) ||                    \
    !defined(CMPI_VER_200)
#error "a version gate is missing"
#endif
#if defined(CMPI_VER_210)
#error "the tables are not those of 2.1"
#endif
#if !defined(_CMPIPL_H_) || !defined(_CMPIOS_H_) || !defined(_CMPIDT_H_) ||                        \
    !defined(_CMPIFT_H_) || !defined(_CMPIMACS_H_)
#error "cmpift.h must bring all headers, under their usual guards"
#endif

} // namespace
