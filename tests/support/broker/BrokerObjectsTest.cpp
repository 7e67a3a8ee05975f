// How the objects of the recording broker behave when used well.

#include "support/broker/RecordingBroker.h"

#include <cmpimacs.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class BrokerObjectsTest : public testing::Test {
protected:
    ~BrokerObjectsTest() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    RecordingBroker broker_;
    const CMPIBroker* mb_ = broker_.get();
    CMPIStatus status_ = {CMPI_RC_ERROR, nullptr};
};

TEST_F(BrokerObjectsTest, A_path_keeps_its_parts_and_keys) {
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "n", "C", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    CMSetNameSpace(path, "n2");
    CMSetHostname(path, "h");
    CMSetClassName(path, "C2");
    const CMPIUint16 number = 7;
    CMAddKey(path, "Name", "alice", CMPI_chars);
    CMAddKey(path, "Number", &number, CMPI_uint16);
    CMAddKey(path, "NAME", "bob", CMPI_chars);

    EXPECT_STREQ(CMGetCharPtr(CMGetNameSpace(path, nullptr)), "n2");
    EXPECT_STREQ(CMGetCharPtr(CMGetHostname(path, nullptr)), "h");
    EXPECT_STREQ(CMGetCharPtr(CMGetClassName(path, nullptr)), "C2");
    EXPECT_EQ(CMGetKeyCount(path, nullptr), 2u);
    const CMPIData name = CMGetKey(path, "name", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    EXPECT_EQ(name.type, CMPI_string);
    EXPECT_EQ(name.state, CMPI_keyValue);
    EXPECT_STREQ(CMGetCharPtr(name.value.string), "bob");
    CMPIString* keyName = nullptr;
    EXPECT_EQ(CMGetKeyAt(path, 1, &keyName, nullptr).value.uint16, 7);
    EXPECT_STREQ(CMGetCharPtr(keyName), "Number");
    CMGetKey(path, "Other", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_STREQ(CMGetCharPtr(CMObjectPathToString(path, nullptr)),
                 "//h/n2:C2.Name=\"bob\",Number=7");
}

TEST_F(BrokerObjectsTest, Parts_of_a_path_are_copied_from_another) {
    const CMPIObjectPath* const source = broker_.makePath("n", "C", {{"K", "v"}}, "h");
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "", "", nullptr);
    CMSetNameSpaceFromObjectPath(path, source);
    EXPECT_EQ(broker_.inspect(path).toString(), "n:C");
    CMSetHostAndNameSpaceFromObjectPath(path, source);
    EXPECT_EQ(broker_.inspect(path).toString(), "//h/n:C");
}

TEST_F(BrokerObjectsTest, A_string_shows_its_text_at_its_handle) {
    const CMPIString* const string = CMNewString(mb_, "text", nullptr);
    EXPECT_STREQ(static_cast<const char*>(string->hdl), "text");
}

TEST_F(BrokerObjectsTest, Every_scalar_type_survives_a_property) {
    CMPIInstance* const instance = CMNewInstance(mb_, broker_.makePath("n", "C"), nullptr);
    const CMPIBoolean boolean = 5;
    const CMPISint8 small = -8;
    const CMPIUint64 large = 0xFFFFFFFFFFFFFFFFULL;
    const CMPISint64 negative = -5;
    const CMPIReal64 real = 0.1;
    const CMPIReal32 single = 0.5F;
    const CMPIChar16 letter = 65;
    CMSetProperty(instance, "boolean", &boolean, CMPI_boolean);
    CMSetProperty(instance, "small", &small, CMPI_sint8);
    CMSetProperty(instance, "large", &large, CMPI_uint64);
    CMSetProperty(instance, "negative", &negative, CMPI_sint64);
    CMSetProperty(instance, "real", &real, CMPI_real64);
    CMSetProperty(instance, "single", &single, CMPI_real32);
    CMSetProperty(instance, "letter", &letter, CMPI_char16);
    CMSetProperty(instance, "none", nullptr, CMPI_uint32);

    EXPECT_EQ(CMGetProperty(instance, "boolean", nullptr).value.boolean, 1);
    EXPECT_EQ(CMGetProperty(instance, "small", nullptr).value.sint8, -8);
    EXPECT_EQ(CMGetProperty(instance, "large", nullptr).value.uint64, large);
    EXPECT_EQ(CMGetProperty(instance, "negative", nullptr).value.sint64, -5);
    EXPECT_EQ(CMGetProperty(instance, "real", nullptr).value.real64, 0.1);
    EXPECT_EQ(CMGetProperty(instance, "single", nullptr).value.real32, 0.5F);
    EXPECT_EQ(CMGetProperty(instance, "letter", nullptr).value.char16, 65);
    const CMPIData none = CMGetProperty(instance, "none", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    EXPECT_EQ(none.type, CMPI_uint32);
    EXPECT_EQ(none.state, CMPI_nullValue);
    EXPECT_EQ(broker_.inspect(instance).propertyText("none"), "<null>");
    EXPECT_EQ(broker_.inspect(instance).propertyText("boolean"), "true");
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 8u);
}

TEST_F(BrokerObjectsTest, Objects_in_a_property_are_copies) {
    CMPIInstance* const instance = CMNewInstance(mb_, broker_.makePath("n", "C"), nullptr);
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "n", "D", nullptr);
    CMPIDateTime* const date = CMNewDateTimeFromChars(mb_, "20240229235959.123456+060", nullptr);
    CMSetProperty(instance, "Ref", &path, CMPI_ref);
    CMSetProperty(instance, "Date", &date, CMPI_dateTime);
    CMSetProperty(instance, "Inst", &instance, CMPI_instance);
    CMSetClassName(path, "Changed");

    const CMPIData ref = CMGetProperty(instance, "Ref", nullptr);
    EXPECT_EQ(broker_.inspect(ref.value.ref).className, "D");
    const CMPIData read = CMGetProperty(instance, "Date", nullptr);
    EXPECT_STREQ(CMGetCharPtr(CMGetStringFormat(read.value.dateTime, nullptr)),
                 "20240229235959.123456+060");
    const CMPIData inner = CMGetProperty(instance, "Inst", nullptr);
    EXPECT_THAT(broker_.inspect(inner.value.inst).propertyNames(), ElementsAre("Ref", "Date"));
    EXPECT_EQ(broker_.inspect(instance).property("Ref")->path->className, "D");
}

TEST_F(BrokerObjectsTest, An_array_keeps_its_elements_and_its_type) {
    CMPIArray* const array = CMNewArray(mb_, 3, CMPI_uint16, &status_);
    const CMPIUint16 number = 9;
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &number, CMPI_uint16).rc, CMPI_RC_OK);
    EXPECT_EQ(CMGetArrayCount(array, nullptr), 3u);
    EXPECT_EQ(CMGetArrayType(array, nullptr), CMPI_uint16);
    EXPECT_EQ(CMGetArrayElementAt(array, 0, nullptr).state, CMPI_nullValue);
    EXPECT_EQ(CMGetArrayElementAt(array, 1, nullptr).value.uint16, 9);

    CMPIInstance* const instance = CMNewInstance(mb_, broker_.makePath("n", "C"), nullptr);
    CMSetProperty(instance, "A", &array, CMPI_uint16A);
    const CMPIData data = CMGetProperty(instance, "A", nullptr);
    EXPECT_EQ(data.type, CMPI_uint16A);
    EXPECT_EQ(CMGetArrayCount(data.value.array, nullptr), 3u);
    const Value recorded = *broker_.inspect(instance).property("A");
    EXPECT_EQ(recorded.text, "{null,9,null}");
    EXPECT_EQ(recorded.elements[1], Value::uint16(9));
    EXPECT_EQ(recorded.describe(), "uint16[],{null,9,null}");
}

TEST_F(BrokerObjectsTest, A_filter_drops_what_it_does_not_list) {
    CMPIInstance* const instance = CMNewInstance(mb_, broker_.makePath("n", "C"), nullptr);
    const char* listed[] = {"a", nullptr};
    CMSetProperty(instance, "Early", "x", CMPI_chars);
    CMSetPropertyFilter(instance, listed, nullptr);
    EXPECT_EQ(CMSetProperty(instance, "A", "x", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(CMSetProperty(instance, "B", "x", CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_THAT(broker_.inspect(instance).propertyNames(), ElementsAre("A"));
    EXPECT_EQ(CMGetPropertyCount(instance, nullptr), 1u);
    CMReturnInstance(broker_.result(), instance);
    EXPECT_THAT(broker_.returnedInstances()[0].propertyNames(), ElementsAre("A"));

    const char* none[] = {nullptr};
    CMSetPropertyFilter(instance, none, nullptr);
    EXPECT_THAT(broker_.inspect(instance).propertyNames(), IsEmpty());
    CMSetPropertyFilter(instance, nullptr, listed);
    EXPECT_THAT(broker_.inspect(instance).propertyNames(), ElementsAre("Early", "A"));
}

TEST_F(BrokerObjectsTest, A_filter_can_be_ignored) {
    broker_.ignorePropertyFilter(true);
    CMPIInstance* const instance = CMNewInstance(mb_, broker_.makePath("n", "C"), nullptr);
    const char* none[] = {nullptr};
    EXPECT_EQ(CMSetPropertyFilter(instance, none, nullptr).rc, CMPI_RC_OK);
    CMSetProperty(instance, "A", "x", CMPI_chars);
    EXPECT_THAT(broker_.inspect(instance).propertyNames(), ElementsAre("A"));
    EXPECT_EQ(broker_.calls()[1], "setPropertyFilter({},null)");
}

TEST_F(BrokerObjectsTest, An_instance_hands_out_and_takes_paths_as_copies) {
    CMPIInstance* const instance =
        CMNewInstance(mb_, broker_.makePath("n", "C", {{"K", "v"}}), nullptr);
    CMPIObjectPath* const path = CMGetObjectPath(instance, nullptr);
    EXPECT_EQ(broker_.inspect(path).toString(), "n:C.K=\"v\"");
    CMSetClassName(path, "D");
    EXPECT_EQ(broker_.inspect(instance).path.className, "C");
    CMSetObjectPath(instance, path);
    EXPECT_EQ(broker_.inspect(instance).path.className, "D");
}

TEST_F(BrokerObjectsTest, Arguments_are_read_by_name_and_position) {
    CMPIArgs* const args = broker_.makeArgs()
                               .string("S", "text")
                               .nullString("N")
                               .boolean("B", true)
                               .uint16("U", 5)
                               .dateTime("D", "not checked")
                               .nullOf("Z", CMPI_uint32);
    EXPECT_EQ(CMGetArgCount(args, nullptr), 6u);
    CMPIString* name = nullptr;
    const CMPIData first = CMGetArgAt(args, 0, &name, nullptr);
    EXPECT_STREQ(CMGetCharPtr(name), "S");
    EXPECT_STREQ(CMGetCharPtr(first.value.string), "text");
    EXPECT_EQ(CMGetArg(args, "n", nullptr).state, CMPI_nullValue);
    EXPECT_EQ(CMGetArg(args, "n", nullptr).type, CMPI_string);
    EXPECT_EQ(CMGetArg(args, "B", nullptr).value.boolean, 1);
    const CMPIData date = CMGetArg(args, "D", nullptr);
    EXPECT_STREQ(CMGetCharPtr(CMGetStringFormat(date.value.dateTime, nullptr)), "not checked");
    EXPECT_EQ(CMGetArg(args, "Z", nullptr).type, CMPI_uint32);
}

TEST_F(BrokerObjectsTest, A_value_can_be_without_object_or_without_handle) {
    const CMPIObjectPath* const path = broker_.makePath(
        "n", "C", {{"A", Value::missing(CMPI_string)}, {"B", Value::withoutHandle(CMPI_string)}});
    const CMPIData missing = CMGetKey(path, "A", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    EXPECT_EQ(missing.state, CMPI_keyValue);
    EXPECT_EQ(missing.value.string, nullptr);
    const CMPIData hollow = CMGetKey(path, "B", nullptr);
    ASSERT_NE(hollow.value.string, nullptr);
    EXPECT_TRUE(CMIsNullObject(hollow.value.string));
    EXPECT_EQ(CMGetArg(broker_.makeArgs().stringWithoutValue("A"), "A", nullptr).value.string,
              nullptr);
}

TEST_F(BrokerObjectsTest, The_context_holds_the_usual_entries_and_more) {
    broker_.setContextEntry(CMPIPrincipal, "root");
    broker_.setContextEntry("Extra", Value::uint32(3));
    const CMPIContext* const ctx = broker_.context();
    EXPECT_STREQ(CMGetCharPtr(CMGetContextEntry(ctx, CMPIPrincipal, nullptr).value.string), "root");
    EXPECT_EQ(CMGetContextEntry(ctx, CMPIInvocationFlags, nullptr).value.uint32, 0u);
    EXPECT_EQ(CMGetContextEntryCount(ctx, nullptr), 6u);
    const CMPIUint32 more = 4;
    CMAddContextEntry(ctx, "More", &more, CMPI_uint32);
    CMPIString* name = nullptr;
    EXPECT_EQ(CMGetContextEntryAt(ctx, 6, &name, nullptr).value.uint32, 4u);
    EXPECT_STREQ(CMGetCharPtr(name), "More");
}

TEST_F(BrokerObjectsTest, A_clone_is_deep_and_outlives_the_call) {
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "n", "C", nullptr);
    CMPIObjectPath* const clone = CMClone(path, &status_);
    CMSetClassName(path, "D");
    broker_.beginCall();
    EXPECT_EQ(broker_.inspect(clone).className, "C");
    EXPECT_EQ(broker_.liveClones(), 1u);
    EXPECT_EQ(CMRelease(clone).rc, CMPI_RC_OK);
    EXPECT_EQ(broker_.liveClones(), 0u);
}

TEST_F(BrokerObjectsTest, Objects_know_their_type) {
    const CMPIObjectPath* const path = broker_.makePath("n", "C");
    EXPECT_STREQ(CMGetCharPtr(CDGetType(mb_, path, nullptr)), "CMPIObjectPath");
    EXPECT_TRUE(CDIsOfType(mb_, path, "CMPIObjectPath", nullptr));
    EXPECT_FALSE(CDIsOfType(mb_, path, "CMPIInstance", nullptr));
    EXPECT_STREQ(CMGetCharPtr(CDToString(mb_, path, nullptr)), "n:C");
    EXPECT_TRUE(CMClassPathIsA(mb_, path, "c", nullptr));
    EXPECT_FALSE(CMClassPathIsA(mb_, path, "d", nullptr));
}

TEST_F(BrokerObjectsTest, Services_that_are_not_offered_say_so) {
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "n", "C", nullptr);
    const CMPIInstance* const instance = CMNewInstance(mb_, path, nullptr);
    const CMPIContext* const ctx = broker_.context();
    EXPECT_EQ(CBGetInstance(mb_, ctx, path, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBDeleteInstance(mb_, ctx, path).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBModifyInstance(mb_, ctx, path, instance, nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CBAssociators(mb_, ctx, path, nullptr, nullptr, nullptr, nullptr, nullptr, &status_),
              nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    CMGetClassQualifier(path, "Q", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(CMNewSelectExp(mb_, "q", "WQL", nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    const CMPIString* const text =
        CMGetMessage(mb_, "id", "default", &status_, CMFmtArgs1(CMFmtUint(1)));
    EXPECT_STREQ(CMGetCharPtr(text), "default");
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

} // namespace

} // namespace qelo::test
