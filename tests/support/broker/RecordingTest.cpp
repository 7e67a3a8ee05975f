// What the recording broker writes down, and how it answers when used well.

#include "cmpi/StubsInC.h"
#include "support/broker/RecordingBroker.h"

#include <cmpimacs.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstring>
#include <thread>

namespace qelo::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class RecordingTest : public testing::Test {
protected:
    ~RecordingTest() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    RecordingBroker broker_;
    const CMPIBroker* mb_ = broker_.get();
    CMPIStatus status_ = {CMPI_RC_ERROR, nullptr};
};

// Whether all pointers of a table, from the first function on, are set.
template <typename Table> bool isComplete(const Table* table, std::size_t firstSlot) {
    const char* const bytes = reinterpret_cast<const char*>(table);
    for (std::size_t at = firstSlot; at < sizeof(Table); at += sizeof(void*)) {
        void* slot = nullptr;
        std::memcpy(&slot, bytes + at, sizeof slot);
        if (slot == nullptr) {
            return false;
        }
    }
    return true;
}

TEST_F(RecordingTest, No_slot_of_any_table_is_null) {
    EXPECT_TRUE(isComplete(mb_->bft, 16));
    EXPECT_TRUE(isComplete(mb_->eft, 8));
    EXPECT_TRUE(isComplete(mb_->xft, 8));
    CMPIObjectPath* const path = CMNewObjectPath(mb_, "n", "C", nullptr);
    CMPIDateTime* const date = CMNewDateTime(mb_, nullptr);
    EXPECT_TRUE(isComplete(path->ft, 8));
    EXPECT_TRUE(isComplete(date->ft, 8));
    EXPECT_TRUE(isComplete(CMNewInstance(mb_, path, nullptr)->ft, 8));
    EXPECT_TRUE(isComplete(CMNewString(mb_, "", nullptr)->ft, 8));
    EXPECT_TRUE(isComplete(CMNewArgs(mb_, nullptr)->ft, 8));
    EXPECT_TRUE(isComplete(CMNewArray(mb_, 0, CMPI_string, nullptr)->ft, 8));
    EXPECT_TRUE(isComplete(CBEnumInstances(mb_, broker_.context(), path, nullptr, nullptr)->ft, 8));
    EXPECT_TRUE(isComplete(broker_.context()->ft, 8));
    EXPECT_TRUE(isComplete(broker_.result()->ft, 8));
}

TEST_F(RecordingTest, The_tables_say_200_and_promise_no_memory_services) {
    EXPECT_EQ(CBBrokerVersion(mb_), 200);
    EXPECT_EQ(mb_->eft->ftVersion, 200);
    EXPECT_EQ(mb_->xft->ftVersion, 200);
    EXPECT_EQ(mb_->mft, nullptr);
    EXPECT_EQ(CBGetCapabilities(mb_) & CMPI_MB_Supports_MemEnhancements, 0u);
}

TEST_F(RecordingTest, An_operation_of_a_provider_is_recorded_from_call_to_result) {
    CMPIInstanceMI* const mi = CSample_Create_InstanceMI(mb_, broker_.context(), &status_);
    const CMPIObjectPath* const path =
        broker_.makePath("root/cimv2", "Sample", {{"Name", "alice"}}, "host");

    const Outcome outcome = broker_.run([&](const CMPIContext* ctx, const CMPIResult* rslt) {
        return mi->ft->enumerateInstances(mi, ctx, rslt, path, nullptr);
    });

    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_FALSE(outcome.hasMessage);
    EXPECT_THAT(broker_.calls(),
                ElementsAre("newInstance(root/cimv2:Sample)", "setPropertyFilter(null,null)",
                            "setProperty(Name,chars,\"text\")", "setProperty(Number,uint32,5)",
                            "returnInstance", "returnDone"));
    ASSERT_EQ(broker_.returnedInstances().size(), 1u);
    const Instance instance = broker_.returnedInstances()[0];
    EXPECT_THAT(instance.properties, ElementsAre(NamedValue{"Name", Value::chars("text")},
                                                 NamedValue{"Number", Value::uint32(5)}));
    EXPECT_EQ(instance.propertyText("NUMBER"), "5");
    EXPECT_EQ(instance.propertyText("Missing"), "<none>");
    EXPECT_EQ(instance.path.toString(), "//host/root/cimv2:Sample.Name=\"alice\"");
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(RecordingTest, Paths_and_data_are_recorded) {
    CMPIMethodMI* const mi = CSample_Create_MethodMI(mb_, broker_.context(), &status_);
    const CMPIObjectPath* const path = broker_.makePath("n", "C");
    ArgsBuilder in = broker_.makeArgs().string("A", "x").uint32("B", 5);
    ArgsBuilder out = broker_.makeArgs();
    broker_.run([&](const CMPIContext* ctx, const CMPIResult* rslt) {
        CMReturnObjectPath(rslt, path);
        return mi->ft->invokeMethod(mi, ctx, rslt, path, "M", in, out);
    });
    EXPECT_THAT(broker_.returnedData(), ElementsAre(Value::uint32(2)));
    ASSERT_EQ(broker_.returnedPaths().size(), 1u);
    EXPECT_EQ(broker_.returnedPaths()[0].className, "C");
    EXPECT_THAT(broker_.inspect(out.get()), ElementsAre(NamedValue{"Count", Value::uint32(2)}));
}

TEST_F(RecordingTest, A_new_call_forgets_the_last_one) {
    CMNewString(mb_, "x", nullptr);
    CMTraceMessage(mb_, CMPI_LEV_INFO, "c", "t", nullptr);
    CMReturnDone(broker_.result());
    EXPECT_EQ(broker_.callCount(), 3u);
    EXPECT_EQ(broker_.callCount("newString"), 1u);
    broker_.beginCall();
    EXPECT_EQ(broker_.callCount(), 0u);
    EXPECT_EQ(broker_.callCount("newString"), 0u);
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_THAT(broker_.traces(), IsEmpty());
    CMReturnDone(broker_.result());
}

TEST_F(RecordingTest, What_a_test_makes_and_inspects_is_not_recorded) {
    const CMPIObjectPath* const path = broker_.makePath("n", "C", {{"K", Value::uint32(1)}});
    const CMPIInstance* const instance = broker_.makeInstance({}, {{"P", "v"}});
    broker_.makeArgs().string("A", "v");
    EXPECT_EQ(broker_.inspect(path).keyText("K"), "1");
    EXPECT_EQ(broker_.inspect(instance).propertyText("P"), "v");
    EXPECT_EQ(broker_.inspect(broker_.makeString("t")), "t");
    EXPECT_THAT(broker_.calls(), IsEmpty());
}

TEST_F(RecordingTest, Traces_and_logs_are_kept_with_level_and_component) {
    CMPIString* const text = CMNewString(mb_, "from string", nullptr);
    EXPECT_EQ(CMTraceMessage(mb_, CMPI_LEV_WARNING, "Unit", "text", nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(CMTraceMessage(mb_, CMPI_LEV_INFO, nullptr, nullptr, text).rc, CMPI_RC_OK);
    EXPECT_EQ(CMLogMessage(mb_, CMPI_SEV_ERROR, "id", "text", text).rc, CMPI_RC_OK);
    EXPECT_THAT(broker_.traces(),
                ElementsAre(BrokerTrace{2, "Unit", "text"}, BrokerTrace{1, "", "from string"}));
    EXPECT_THAT(broker_.logs(), ElementsAre(BrokerTrace{1, "id", "text"}));
    EXPECT_EQ(broker_.calls()[1], "trace(2,Unit,text)");
    broker_.refuseTraces(true);
    EXPECT_EQ(CMTraceMessage(mb_, CMPI_LEV_INFO, "Unit", "text", nullptr).rc,
              CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker_.traces().size(), 3u);
}

TEST_F(RecordingTest, The_message_of_a_status_is_read) {
    const Outcome outcome = broker_.run([&](const CMPIContext*, const CMPIResult*) {
        CMReturnWithChars(mb_, CMPI_RC_ERR_FAILED, "why");
    });
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(outcome.message, "why");
}

// ---- Up-calls

TEST_F(RecordingTest, Enumerations_answer_what_the_test_has_set) {
    const CMPIObjectPath* const first = broker_.makePath("n", "Peer", {{"Name", "1"}});
    const CMPIObjectPath* const second = broker_.makePath("n", "Peer", {{"Name", "2"}});
    broker_.answerInstanceNames("Peer", {{first, nullptr, broker_.nullHandlePath(), second}});

    const CMPIObjectPath* const peer = CMNewObjectPath(mb_, "n", "PEER", nullptr);
    CMPIEnumeration* const names = CBEnumInstanceNames(mb_, broker_.context(), peer, &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    const CMPIData one = CMGetNext(names, nullptr);
    EXPECT_EQ(one.type, CMPI_ref);
    EXPECT_NE(one.value.ref, first);
    EXPECT_EQ(broker_.inspect(one.value.ref).keyText("Name"), "1");
    EXPECT_EQ(CMGetNext(names, nullptr).value.ref, nullptr);
    const CMPIData hollow = CMGetNext(names, nullptr);
    ASSERT_NE(hollow.value.ref, nullptr);
    EXPECT_TRUE(CMIsNullObject(hollow.value.ref));
    EXPECT_TRUE(CMHasNext(names, nullptr));
    EXPECT_EQ(broker_.inspect(CMGetNext(names, nullptr).value.ref).keyText("Name"), "2");
    EXPECT_FALSE(CMHasNext(names, nullptr));
    CMGetNext(names, &status_);
    EXPECT_EQ(status_.rc, CMPI_RC_NO_MORE_ELEMENTS);
    EXPECT_EQ(CMGetArrayCount(CMToArray(names, nullptr), nullptr), 4u);
    EXPECT_EQ(broker_.calls()[1], "enumerateInstanceNames(n:PEER)");
}

TEST_F(RecordingTest, An_enumeration_of_an_unknown_class_is_empty) {
    const CMPIObjectPath* const path = broker_.makePath("n", "C");
    const CMPIContext* const ctx = broker_.context();
    EXPECT_FALSE(CMHasNext(CBEnumInstanceNames(mb_, ctx, path, &status_), nullptr));
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    EXPECT_FALSE(CMHasNext(CBEnumInstances(mb_, ctx, path, nullptr, &status_), nullptr));
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
}

TEST_F(RecordingTest, An_enumeration_can_fail_or_be_null) {
    const CMPIObjectPath* const path = broker_.makePath("n", "C");
    broker_.answerInstances("C", {{}, true, CMPI_RC_ERR_ACCESS_DENIED, "no"});
    EXPECT_EQ(CBEnumInstances(mb_, broker_.context(), path, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(broker_.inspect(status_.msg), "no");
    broker_.answerInstances("C", {{}, false, CMPI_RC_ERR_FAILED, ""});
    EXPECT_NE(CBEnumInstances(mb_, broker_.context(), path, nullptr, &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status_.msg, nullptr);
}

TEST_F(RecordingTest, Enumerated_instances_have_the_properties_asked_for) {
    const CMPIObjectPath* const path = broker_.makePath("n", "C");
    broker_.answerInstances("C", {{broker_.makeInstance({}, {{"A", "1"}, {"B", "2"}})}});
    const char* wanted[] = {"b", nullptr};
    CMPIEnumeration* found = CBEnumInstances(mb_, broker_.context(), path, wanted, nullptr);
    EXPECT_THAT(broker_.inspect(CMGetNext(found, nullptr).value.inst).propertyNames(),
                ElementsAre("B"));
    broker_.ignorePropertyFilter(true);
    found = CBEnumInstances(mb_, broker_.context(), path, wanted, nullptr);
    EXPECT_THAT(broker_.inspect(CMGetNext(found, nullptr).value.inst).propertyNames(),
                ElementsAre("A", "B"));
}

// ---- Threads

void* addOne(void* number) {
    ++*static_cast<int*>(number);
    return number;
}

TEST_F(RecordingTest, The_systems_services_run_threads_and_keep_locks) {
    const CMPIBrokerExtFT* const xft = mb_->xft;
    int number = 0;
    void* const mutex = xft->newMutex(0);
    xft->lockMutex(mutex);
    xft->lockMutex(mutex);
    void* const thread = xft->newThread(addOne, &number, 0);
    void* code = nullptr;
    EXPECT_EQ(xft->joinThread(thread, &code), 0);
    xft->unlockMutex(mutex);
    xft->unlockMutex(mutex);
    xft->destroyMutex(mutex);
    EXPECT_EQ(number, 1);
    EXPECT_EQ(code, &number);
    EXPECT_STREQ(xft->resolveFileName("X"), "libX.so");

    CMPIContext* const context = CBPrepareAttachThread(mb_, broker_.context());
    EXPECT_EQ(CBAttachThread(mb_, context).rc, CMPI_RC_OK);
    EXPECT_EQ(CBDetachThread(mb_, context).rc, CMPI_RC_OK);
}

TEST_F(RecordingTest, Calls_of_several_threads_are_all_recorded) {
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([this] {
            for (int k = 0; k < 100; ++k) {
                CMGetCharPtr(CMNewString(mb_, "x", nullptr));
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(broker_.callCount("newString"), 400u);
    EXPECT_EQ(broker_.callCount(), 800u);
}

TEST_F(RecordingTest, Two_brokers_keep_their_records_apart) {
    RecordingBroker other;
    CMNewString(other.get(), "x", nullptr);
    EXPECT_EQ(other.callCount(), 1u);
    EXPECT_EQ(broker_.callCount(), 0u);
    CMReturnDone(broker_.result());
    EXPECT_EQ(broker_.doneCount(), 1);
    EXPECT_EQ(other.doneCount(), 0);
}

} // namespace

} // namespace qelo::test
