// What the convenience layer offers beyond calls of single slots.

#include "cmpi/StubsInC.h"

#include <cmpi/cmpimacs.h>

#include <gtest/gtest.h>

#include <cstdarg>
#include <cstdint>
#include <string>
#include <vector>

namespace {

// ---- A broker that makes strings and keeps what messages were asked for

std::vector<std::string> textsMade;
CMPIString theString = {&theString, nullptr};

CMPIString* newString(const CMPIBroker*, const char* text, CMPIStatus* status) {
    EXPECT_EQ(status, nullptr);
    textsMade.emplace_back(text);
    return &theString;
}

struct Pair {
    int type;
    std::string value;
};
std::vector<Pair> messageArguments;

std::string nextArgument(int type, va_list& arguments) {
    switch (type) {
    case CMPI_sint32:
        return std::to_string(va_arg(arguments, long));
    case CMPI_uint32:
        return std::to_string(va_arg(arguments, unsigned long));
    case CMPI_sint64:
        return std::to_string(va_arg(arguments, long long));
    case CMPI_uint64:
        return std::to_string(va_arg(arguments, unsigned long long));
    case CMPI_real64:
        return std::to_string(va_arg(arguments, double));
    case CMPI_boolean:
        return std::to_string(va_arg(arguments, int));
    case CMPI_chars:
        return va_arg(arguments, const char*);
    default:
        return va_arg(arguments, const CMPIString*) == &theString ? "string" : "?";
    }
}

void keepArguments(CMPICount count, va_list& arguments) {
    messageArguments.clear();
    for (CMPICount i = 0; i < count; ++i) {
        const int type = va_arg(arguments, int);
        messageArguments.push_back({type, nextArgument(type, arguments)});
    }
}

CMPIString* getMessage(const CMPIBroker*, const char* id, const char* text, CMPIStatus*,
                       CMPICount count, ...) {
    EXPECT_STREQ(id, "ID");
    EXPECT_STREQ(text, "$0");
    va_list arguments;
    va_start(arguments, count);
    keepArguments(count, arguments);
    va_end(arguments);
    return &theString;
}

int aFile = 0;

CMPIString* getMessage2(const CMPIBroker*, const char* id, const CMPIMsgFileHandle handle,
                        const char*, CMPIStatus*, CMPICount count, ...) {
    EXPECT_STREQ(id, "ID");
    EXPECT_EQ(handle, &aFile);
    va_list arguments;
    va_start(arguments, count);
    keepArguments(count, arguments);
    va_end(arguments);
    return &theString;
}

struct TestBroker {
    TestBroker() {
        textsMade.clear();
        table.newString = newString;
        table.getMessage = getMessage;
        table.getMessage2 = getMessage2;
        broker.eft = &table;
    }
    CMPIBrokerEncFT table = {};
    CMPIBroker broker = {};
};

// ---- Tests of objects and values

TEST(CmpiConvenience, An_object_is_null_without_pointer_or_without_handle) {
    CMPIObjectPath path = {nullptr, nullptr};
    EXPECT_TRUE(CMIsNullObject(nullptr));
    EXPECT_TRUE(CMIsNullObject(&path));
    path.hdl = &path;
    EXPECT_FALSE(CMIsNullObject(&path));
}

TEST(CmpiConvenience, State_and_type_bits_beyond_the_first_eight_are_seen) {
    CMPIData data = {CMPI_string, CMPI_goodValue, {0}};
    EXPECT_EQ(CMIsNullValue(data), 0);
    EXPECT_EQ(CMIsKeyValue(data), 0);
    EXPECT_EQ(CMIsArray(data), 0);
    data.state = CMPI_nullValue;
    EXPECT_EQ(CMIsNullValue(data), 1);
    EXPECT_EQ(CMIsKeyValue(data), 0);
    data.state = CMPI_keyValue;
    EXPECT_EQ(CMIsNullValue(data), 0);
    EXPECT_EQ(CMIsKeyValue(data), 1);
    data.type = CMPI_stringA;
    EXPECT_EQ(CMIsArray(data), 1);
}

// ---- Status

CMPIStatus returnCode() { CMReturn(CMPI_RC_ERR_NOT_FOUND); }
CMPIStatus returnString(CMPIString* string) { CMReturnWithString(CMPI_RC_ERR_FAILED, string); }
CMPIStatus returnChars(const CMPIBroker* broker, const char* text) {
    CMReturnWithChars(broker, CMPI_RC_ERR_FAILED, text);
}

TEST(CmpiConvenience, A_returned_status_carries_code_and_message) {
    TestBroker test;
    EXPECT_EQ(returnCode().rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(returnCode().msg, nullptr);
    EXPECT_EQ(returnString(&theString).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(returnString(&theString).msg, &theString);
    EXPECT_EQ(returnString(nullptr).msg, nullptr);
    const CMPIStatus status = returnChars(&test.broker, "text");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, &theString);
    EXPECT_EQ(textsMade, std::vector<std::string>{"text"});
}

TEST(CmpiConvenience, A_returned_text_without_broker_gives_no_message) {
    EXPECT_EQ(returnChars(nullptr, "text").rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(returnChars(nullptr, "text").msg, nullptr);
}

TEST(CmpiConvenience, A_null_text_gives_no_message_and_is_not_passed_to_the_broker) {
    TestBroker test;
    EXPECT_EQ(returnChars(&test.broker, nullptr).msg, nullptr);
    EXPECT_TRUE(textsMade.empty());
}

TEST(CmpiConvenience, A_status_is_set_with_code_and_message) {
    TestBroker test;
    CMPIStatus status = {CMPI_RC_OK, &theString};
    CMSetStatus(&status, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(status.msg, nullptr);
    CMSetStatusWithString(&status, CMPI_RC_ERR_FAILED, &theString);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, &theString);
    CMSetStatusWithChars(nullptr, &status, CMPI_RC_ERR_NOT_FOUND, "text");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(status.msg, nullptr);
    CMSetStatusWithChars(&test.broker, &status, CMPI_RC_ERR_NOT_FOUND, "text");
    EXPECT_EQ(status.msg, &theString);
    EXPECT_EQ(textsMade, std::vector<std::string>{"text"});
}

TEST(CmpiConvenience, A_null_status_is_left_alone) {
    TestBroker test;
    CMSetStatus(nullptr, CMPI_RC_ERR_FAILED);
    CMSetStatusWithString(nullptr, CMPI_RC_ERR_FAILED, &theString);
    CMSetStatusWithChars(&test.broker, nullptr, CMPI_RC_ERR_FAILED, "text");
    EXPECT_TRUE(textsMade.empty());
}

// ---- Messages

TEST(CmpiConvenience, Message_arguments_arrive_as_pairs_of_type_and_value) {
    TestBroker test;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const message =
        CMGetMessage(&test.broker, "ID", "$0", &status,
                     CMFmtArgs8(CMFmtSint(-5), CMFmtUint(5u), CMFmtSint64(INT64_MIN),
                                CMFmtUint64(UINT64_MAX), CMFmtReal(0.5f), CMFmtBoolean(true),
                                CMFmtChars("text"), CMFmtString(&theString)));
    EXPECT_EQ(message, &theString);
    const std::vector<Pair> expected = {{CMPI_sint32, "-5"},
                                        {CMPI_uint32, "5"},
                                        {CMPI_sint64, "-9223372036854775808"},
                                        {CMPI_uint64, "18446744073709551615"},
                                        {CMPI_real64, "0.500000"},
                                        {CMPI_boolean, "1"},
                                        {CMPI_chars, "text"},
                                        {CMPI_string, "string"}};
    ASSERT_EQ(messageArguments.size(), expected.size());
    for (std::size_t i = 0; i < expected.size(); ++i) {
        EXPECT_EQ(messageArguments[i].type, expected[i].type) << i;
        EXPECT_EQ(messageArguments[i].value, expected[i].value) << i;
    }
}

TEST(CmpiConvenience, Messages_take_from_none_to_ten_arguments) {
    TestBroker test;
    const CMPIBroker* const broker = &test.broker;
    const auto count = [] { return messageArguments.size(); };
#define A CMFmtSint(1)
#define EXPECT_ARGUMENTS(n, ...)                                                                   \
    CMGetMessage2(broker, "ID", &aFile, "$0", nullptr, __VA_ARGS__);                               \
    EXPECT_EQ(count(), std::size_t{n})
    EXPECT_ARGUMENTS(0, CMFmtArgs0());
    EXPECT_ARGUMENTS(1, CMFmtArgs1(A));
    EXPECT_ARGUMENTS(2, CMFmtArgs2(A, A));
    EXPECT_ARGUMENTS(3, CMFmtArgs3(A, A, A));
    EXPECT_ARGUMENTS(4, CMFmtArgs4(A, A, A, A));
    EXPECT_ARGUMENTS(5, CMFmtArgs5(A, A, A, A, A));
    EXPECT_ARGUMENTS(6, CMFmtArgs6(A, A, A, A, A, A));
    EXPECT_ARGUMENTS(7, CMFmtArgs7(A, A, A, A, A, A, A));
    EXPECT_ARGUMENTS(8, CMFmtArgs8(A, A, A, A, A, A, A, A));
    EXPECT_ARGUMENTS(9, CMFmtArgs9(A, A, A, A, A, A, A, A, A));
    EXPECT_ARGUMENTS(10, CMFmtArgs10(A, A, A, A, A, A, A, A, A, A));
#undef EXPECT_ARGUMENTS
#undef A
}

// ---- The same from C, with the stubs' factories

TEST(CmpiConvenience, A_C_provider_can_use_the_layer) {
    TestBroker test;
    const CMPIStatus status = statusMadeInC(&test.broker);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, &theString);
    EXPECT_EQ(textsMade, std::vector<std::string>{"from C"});
    EXPECT_EQ(messageArguments.size(), 2u);
}

} // namespace
