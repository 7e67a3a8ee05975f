// Misuse of a broker, and that the recording broker notices it.

#include "support/broker/RecordingBroker.h"

#include <cmpimacs.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {

namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class ViolationTest : public testing::Test {
protected:
    void expectOne(const std::string& text) {
        EXPECT_THAT(broker_.violations(), ElementsAre(HasSubstr(text)));
        broker_.clearViolations();
    }

    RecordingBroker broker_;
    const CMPIBroker* mb_ = broker_.get();
    CMPIObjectPath* path_ = broker_.makePath("n", "C");
    CMPIInstance* instance_ = broker_.makeInstance({});
    CMPIStatus status_ = {CMPI_RC_OK, nullptr};
};

TEST_F(ViolationTest, A_null_object) {
    EXPECT_EQ(path_->ft->getNameSpace(nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("getNameSpace: NULL CMPIObjectPath as object");
    EXPECT_EQ(CMReturnInstance(broker_.result(), nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("returnInstance: NULL CMPIInstance as argument");
    EXPECT_EQ(CMNewInstance(mb_, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("newInstance: NULL CMPIObjectPath");
    EXPECT_EQ(mb_->eft->newArgs(nullptr, &status_), nullptr);
    expectOne("newArgs: NULL CMPIBroker");
    EXPECT_EQ(CBEnumInstanceNames(mb_, nullptr, path_, &status_), nullptr);
    expectOne("enumerateInstanceNames: NULL CMPIContext");
}

TEST_F(ViolationTest, An_object_without_a_handle) {
    EXPECT_EQ(CMGetKeyCount(broker_.nullHandlePath(), &status_), 0u);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("getKeyCount: CMPIObjectPath as object without a handle");
    EXPECT_EQ(CMGetCharPtr(broker_.nullHandleString()), nullptr);
    expectOne("getCharPtr: CMPIString as object without a handle");
    EXPECT_EQ(CMReturnInstance(broker_.result(), broker_.nullHandleInstance()).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    expectOne("returnInstance: CMPIInstance as argument without a handle");
}

TEST_F(ViolationTest, An_object_that_no_broker_made) {
    const CMPIObjectPath forged = {&forged, path_->ft};
    EXPECT_EQ(CMReturnObjectPath(broker_.result(), &forged).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("unknown CMPIObjectPath");
}

TEST_F(ViolationTest, An_object_of_another_kind) {
    const auto* const wrong = reinterpret_cast<const CMPIInstance*>(path_);
    EXPECT_EQ(CMReturnInstance(broker_.result(), wrong).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("CMPIObjectPath for CMPIInstance");
}

TEST_F(ViolationTest, An_object_used_after_its_call) {
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "n", "C", nullptr);
    const CMPIResult* const result = broker_.result();
    broker_.beginCall();
    EXPECT_EQ(CMSetHostname(path, "h").rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("setHostname: CMPIObjectPath as object used after its end");
    EXPECT_EQ(CMReturnDone(result).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("returnDone: CMPIResult as object used after its end");
    EXPECT_EQ(broker_.doneCount(), 0);
}

TEST_F(ViolationTest, An_object_used_many_calls_later_is_at_least_unknown) {
    const CMPIString* const string = CMNewString(mb_, "x", nullptr);
    const CMPIStringFT* const table = string->ft;
    for (int i = 0; i < 20; ++i) {
        broker_.beginCall();
    }
    EXPECT_EQ(table->getCharPtr(string, nullptr), nullptr);
    EXPECT_EQ(broker_.violations().size(), 1u);
}

TEST_F(ViolationTest, A_read_out_object_used_after_its_call) {
    const CMPIObjectPath* const path = broker_.makePath("n", "C", {{"K", "v"}});
    const CMPIString* const value = CMGetKey(path, "K", nullptr).value.string;
    broker_.endCall();
    EXPECT_EQ(CMGetCharPtr(value), nullptr);
    expectOne("used after its end");
}

TEST_F(ViolationTest, A_message_that_is_no_live_string) {
    CMPIString* const old = CMNewString(mb_, "x", nullptr);
    const Outcome outcome = broker_.run([&](const CMPIContext*, const CMPIResult*) {
        return CMPIStatus{CMPI_RC_ERR_FAILED, old};
    });
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(outcome.message, "");
    expectOne("status: the message is no live CMPIString");
}

TEST_F(ViolationTest, A_null_name_or_text) {
    EXPECT_EQ(CMSetProperty(instance_, nullptr, "x", CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    expectOne("setProperty: NULL text");
    EXPECT_EQ(CMNewString(mb_, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    expectOne("newString: NULL text");
    EXPECT_EQ(CMNewObjectPath(mb_, nullptr, "C", &status_), nullptr);
    expectOne("newObjectPath: NULL text");
    EXPECT_EQ(CMNewDateTimeFromChars(mb_, nullptr, &status_), nullptr);
    expectOne("newDateTimeFromChars: NULL text");
    EXPECT_EQ(CMTraceMessage(mb_, CMPI_LEV_INFO, "c", nullptr, nullptr).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    expectOne("trace: NULL text");
}

TEST_F(ViolationTest, A_value_without_its_object) {
    CMPIString* const none = nullptr;
    CMPIString* const hollow = broker_.nullHandleString();
    EXPECT_EQ(CMSetProperty(instance_, "P", &none, CMPI_string).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("setProperty: NULL CMPIString");
    EXPECT_EQ(CMSetProperty(instance_, "P", &hollow, CMPI_string).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("setProperty: CMPIString as argument without a handle");
    CMPIDateTime* const noDate = nullptr;
    CMSetProperty(instance_, "P", &noDate, CMPI_dateTime);
    expectOne("setProperty: NULL CMPIDateTime");
    CMPIArray* const noArray = nullptr;
    CMSetProperty(instance_, "P", &noArray, CMPI_stringA);
    expectOne("setProperty: NULL CMPIArray");
    EXPECT_THAT(broker_.inspect(instance_).properties, IsEmpty());
}

TEST_F(ViolationTest, An_unknown_type) {
    const CMPIUint32 number = 1;
    EXPECT_EQ(CMSetProperty(instance_, "P", &number, CMPI_null).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    expectOne("setProperty: unknown type null");
    EXPECT_EQ(CMNewArray(mb_, 1, CMPI_stringA, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    expectOne("newArray: unknown type string[]");
    EXPECT_EQ(CMReturnData(broker_.result(), &number, 0x4321).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    expectOne("returnData: unknown type 0x4321");
}

TEST_F(ViolationTest, An_element_of_another_type_than_the_arrays) {
    CMPIArray* const array = CMNewArray(mb_, 1, CMPI_string, nullptr);
    EXPECT_EQ(CMSetArrayElementAt(array, 0, "x", CMPI_chars).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    expectOne("setElementAt: chars into an array of string");
    EXPECT_EQ(CMGetArrayElementAt(array, 0, nullptr).state, CMPI_nullValue);
    EXPECT_EQ(CMSetProperty(instance_, "P", &array, CMPI_uint16A).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    expectOne("setProperty: array of string for uint16[]");
}

TEST_F(ViolationTest, A_position_out_of_range) {
    CMPIArray* const array = CMNewArray(mb_, 1, CMPI_uint16, nullptr);
    const CMPIUint16 number = 1;
    EXPECT_EQ(CMSetArrayElementAt(array, 1, &number, CMPI_uint16).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    expectOne("setElementAt: position out of range");
    CMGetArrayElementAt(array, 1, &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    expectOne("getElementAt: position out of range");
    CMPIString* name = broker_.makeString("old");
    CMGetKeyAt(path_, 0, &name, &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(name, nullptr);
    expectOne("getKeyAt: position out of range");
}

TEST_F(ViolationTest, A_key_that_is_null_or_no_key) {
    EXPECT_EQ(CMAddKey(path_, "K", nullptr, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    expectOne("addKey: NULL as key");
    CMPIArray* const array = CMNewArray(mb_, 0, CMPI_string, nullptr);
    EXPECT_EQ(CMAddKey(path_, "K", &array, CMPI_stringA).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    expectOne("addKey: string[] as key");
}

TEST_F(ViolationTest, Done_twice) {
    EXPECT_EQ(CMReturnDone(broker_.result()).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnDone(broker_.result()).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(broker_.doneCount(), 2);
    expectOne("returnDone: result used after returnDone");
}

TEST_F(ViolationTest, A_result_after_done) {
    CMReturnDone(broker_.result());
    EXPECT_EQ(CMReturnInstance(broker_.result(), instance_).rc, CMPI_RC_ERR_FAILED);
    expectOne("returnInstance: result used after returnDone");
    EXPECT_EQ(CMReturnObjectPath(broker_.result(), path_).rc, CMPI_RC_ERR_FAILED);
    expectOne("returnObjectPath: result used after returnDone");
    const CMPIUint32 number = 1;
    EXPECT_EQ(CMReturnData(broker_.result(), &number, CMPI_uint32).rc, CMPI_RC_ERR_FAILED);
    expectOne("returnData: result used after returnDone");
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
}

TEST_F(ViolationTest, A_release_of_what_belongs_to_the_broker) {
    CMPIString* const string = CMNewString(mb_, "x", nullptr);
    CMRelease(string);
    expectOne("release: release of an object that is no clone");
    EXPECT_STREQ(CMGetCharPtr(string), "x");
}

TEST_F(ViolationTest, A_clone_released_twice) {
    CMPIObjectPath* const clone = CMClone(path_, nullptr);
    CMRelease(clone);
    EXPECT_EQ(CMRelease(clone).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("release: CMPIObjectPath as object used after its end");
}

TEST_F(ViolationTest, A_handle_that_is_missing_in_a_call_about_any_object) {
    EXPECT_EQ(CDGetType(mb_, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("getType: no live object");
}

TEST_F(ViolationTest, Misuse_is_recorded_as_a_call_too) {
    CMReturnInstance(broker_.result(), nullptr);
    EXPECT_THAT(broker_.calls(), ElementsAre("returnInstance(invalid)"));
}

TEST_F(ViolationTest, Names_and_dates_that_are_not_there_are_no_misuse) {
    CMGetProperty(instance_, "Nothing", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    CMGetArg(broker_.makeArgs(), "Nothing", &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(CMNewDateTimeFromChars(mb_, "", &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(broker_.violations(), IsEmpty());
}

TEST_F(ViolationTest, A_broker_that_was_destroyed) {
    auto other = std::make_unique<RecordingBroker>();
    const CMPIBroker* const gone = other->get();
    const CMPIBrokerEncFT* const table = gone->eft;
    other.reset();
    EXPECT_EQ(table->newArgs(gone, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_INVALID_HANDLE);
    expectOne("newArgs: unknown CMPIBroker");
}

using ViolationDeathTest = ViolationTest;

TEST_F(ViolationDeathTest, A_fault_for_an_unknown_slot_ends_the_test) {
    EXPECT_DEATH(broker_.failSlot("newinstance", 1, Fault::null()), "no slot 'newinstance'");
    EXPECT_DEATH(broker_.callCount("done"), "no slot 'done'");
}

TEST_F(ViolationDeathTest, An_answer_of_an_ended_object_ends_the_test) {
    broker_.answerInstanceNames("C", {{CMNewObjectPath(mb_, "n", "C", nullptr)}});
    broker_.beginCall();
    EXPECT_DEATH(CBEnumInstanceNames(mb_, broker_.context(), path_, nullptr), "has ended");
}

} // namespace

} // namespace qelo::test
