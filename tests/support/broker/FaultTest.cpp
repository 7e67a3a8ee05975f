// Calls that a test makes fail.

#include "cmpi/StubsInC.h"
#include "support/broker/RecordingBroker.h"

#include <cmpimacs.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace qelo::test {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class FaultTest : public testing::Test {
protected:
    ~FaultTest() override { EXPECT_THAT(broker_.violations(), IsEmpty()); }

    void expectStatus(CMPIrc rc, const std::string& message = {}) {
        EXPECT_EQ(status_.rc, rc);
        EXPECT_EQ(status_.msg != nullptr, !message.empty());
        const std::string text = status_.msg == nullptr ? "" : broker_.inspect(status_.msg);
        EXPECT_EQ(text, message);
        status_ = {CMPI_RC_ERROR, nullptr};
    }

    RecordingBroker broker_;
    const CMPIBroker* mb_ = broker_.get();
    CMPIObjectPath* path_ = broker_.makePath("n", "C", {{"Name", "x"}});
    CMPIStatus status_ = {CMPI_RC_ERROR, nullptr};
};

TEST_F(FaultTest, The_nth_call_fails_and_the_others_do_not) {
    broker_.failCall(2, Fault::null());
    EXPECT_NE(CMNewString(mb_, "1", nullptr), nullptr);
    EXPECT_FALSE(broker_.faultHit());
    EXPECT_EQ(CMNewString(mb_, "2", nullptr), nullptr);
    EXPECT_TRUE(broker_.faultHit());
    EXPECT_NE(CMNewString(mb_, "3", nullptr), nullptr);
    EXPECT_THAT(broker_.calls(),
                ElementsAre("newString(\"1\")", "newString(\"2\") [fault]", "newString(\"3\")"));
}

TEST_F(FaultTest, The_nth_call_of_a_slot_fails) {
    broker_.failSlot("newString", 2, Fault::null());
    EXPECT_NE(CMNewString(mb_, "1", nullptr), nullptr);
    EXPECT_NE(CMNewObjectPath(mb_, "n", "C", nullptr), nullptr);
    EXPECT_EQ(CMNewString(mb_, "2", nullptr), nullptr);
    EXPECT_NE(CMNewString(mb_, "3", nullptr), nullptr);
}

TEST_F(FaultTest, Every_call_of_a_slot_fails_until_faults_are_cleared) {
    broker_.failSlot("newString", 0, Fault::null());
    EXPECT_EQ(CMNewString(mb_, "1", nullptr), nullptr);
    EXPECT_EQ(CMNewString(mb_, "2", nullptr), nullptr);
    broker_.clearFaults();
    EXPECT_NE(CMNewString(mb_, "3", nullptr), nullptr);
}

TEST_F(FaultTest, Counting_begins_anew_with_each_call_of_the_provider) {
    broker_.failCall(1, Fault::null());
    EXPECT_EQ(CMNewString(mb_, "1", nullptr), nullptr);
    EXPECT_NE(CMNewString(mb_, "2", nullptr), nullptr);
    broker_.beginCall();
    EXPECT_FALSE(broker_.faultHit());
    EXPECT_EQ(CMNewString(mb_, "1", nullptr), nullptr);
}

TEST_F(FaultTest, A_null_fault_gives_empty_results_and_an_innocent_status) {
    for (const char* slot : {"newInstance", "getNameSpace", "getKey", "getKeyCount", "getCharPtr",
                             "isOfType", "setHostname", "getKeyAt"}) {
        broker_.failSlot(slot, 0, Fault::null());
    }
    EXPECT_EQ(CMNewInstance(mb_, path_, &status_), nullptr);
    expectStatus(CMPI_RC_OK);
    EXPECT_EQ(CMGetNameSpace(path_, &status_), nullptr);
    expectStatus(CMPI_RC_OK);
    const CMPIData key = CMGetKey(path_, "Name", &status_);
    EXPECT_TRUE(CMIsNullValue(key));
    EXPECT_EQ(key.value.string, nullptr);
    expectStatus(CMPI_RC_OK);
    EXPECT_EQ(CMGetKeyCount(path_, &status_), 0u);
    expectStatus(CMPI_RC_OK);
    EXPECT_EQ(CMGetCharsPtr(broker_.makeString("x"), &status_), nullptr);
    expectStatus(CMPI_RC_OK);
    EXPECT_FALSE(CDIsOfType(mb_, path_, "CMPIObjectPath", &status_));
    expectStatus(CMPI_RC_OK);
    CMPIString* name = broker_.makeString("old");
    CMGetKeyAt(path_, 0, &name, nullptr);
    EXPECT_EQ(name, nullptr);
    status_ = CMSetHostname(path_, "h");
    expectStatus(CMPI_RC_ERR_FAILED);
    EXPECT_EQ(broker_.inspect(path_).host, "");
}

TEST_F(FaultTest, An_error_fault_gives_empty_results_and_its_status) {
    const Fault fault = Fault::error(CMPI_RC_ERR_ACCESS_DENIED, "no");
    for (const char* slot : {"newInstance", "getKey", "getKeyCount", "setHostname"}) {
        broker_.failSlot(slot, 0, fault);
    }
    EXPECT_EQ(CMNewInstance(mb_, path_, &status_), nullptr);
    expectStatus(CMPI_RC_ERR_ACCESS_DENIED, "no");
    EXPECT_TRUE(CMIsNullValue(CMGetKey(path_, "Name", &status_)));
    expectStatus(CMPI_RC_ERR_ACCESS_DENIED, "no");
    EXPECT_EQ(CMGetKeyCount(path_, &status_), 0u);
    expectStatus(CMPI_RC_ERR_ACCESS_DENIED, "no");
    status_ = CMSetHostname(path_, "h");
    expectStatus(CMPI_RC_ERR_ACCESS_DENIED, "no");
}

TEST_F(FaultTest, A_null_handle_fault_gives_objects_without_handle) {
    for (const char* slot :
         {"newInstance", "newString", "newObjectPath", "newArray", "newDateTimeFromChars", "getKey",
          "getKeyAt", "setHostname", "enumerateInstanceNames", "clone"}) {
        broker_.failSlot(slot, 0, Fault::nullHandle());
    }
    const auto isHollow = [](const auto* object) {
        return object != nullptr && object->hdl == nullptr && object->ft != nullptr;
    };
    EXPECT_TRUE(isHollow(CMNewInstance(mb_, path_, &status_)));
    expectStatus(CMPI_RC_OK);
    EXPECT_TRUE(isHollow(CMNewString(mb_, "x", nullptr)));
    EXPECT_TRUE(isHollow(CMNewObjectPath(mb_, "n", "C", nullptr)));
    EXPECT_TRUE(isHollow(CMNewArray(mb_, 1, CMPI_string, nullptr)));
    EXPECT_TRUE(isHollow(CMNewDateTimeFromChars(mb_, "", nullptr)));
    EXPECT_TRUE(isHollow(CBEnumInstanceNames(mb_, broker_.context(), path_, nullptr)));
    EXPECT_TRUE(isHollow(CMClone(path_, nullptr)));
    const CMPIData key = CMGetKey(path_, "Name", nullptr);
    EXPECT_FALSE(CMIsNullValue(key));
    EXPECT_TRUE(isHollow(key.value.string));
    CMPIString* name = nullptr;
    CMGetKeyAt(path_, 0, &name, nullptr);
    EXPECT_TRUE(isHollow(name));
    status_ = CMSetHostname(path_, "h");
    expectStatus(CMPI_RC_ERR_FAILED);
    EXPECT_EQ(broker_.liveClones(), 0u);
}

TEST_F(FaultTest, An_enumerations_elements_can_be_without_handle) {
    broker_.answerInstanceNames("C", {{path_}});
    broker_.answerInstances("C", {{broker_.makeInstance({})}});
    broker_.failSlot("getNext", 0, Fault::nullHandle());
    CMPIEnumeration* const names = CBEnumInstanceNames(mb_, broker_.context(), path_, nullptr);
    const CMPIData path = CMGetNext(names, nullptr);
    EXPECT_EQ(path.type, CMPI_ref);
    ASSERT_NE(path.value.ref, nullptr);
    EXPECT_EQ(path.value.ref->hdl, nullptr);
    CMPIEnumeration* const found = CBEnumInstances(mb_, broker_.context(), path_, nullptr, nullptr);
    const CMPIData instance = CMGetNext(found, nullptr);
    EXPECT_EQ(instance.type, CMPI_instance);
    ASSERT_NE(instance.value.inst, nullptr);
    EXPECT_EQ(instance.value.inst->hdl, nullptr);
}

TEST_F(FaultTest, A_failed_result_call_returns_nothing) {
    broker_.failSlot("returnObjectPath", 0, Fault::error(CMPI_RC_ERR_INVALID_HANDLE));
    broker_.failSlot("returnDone", 0, Fault::error());
    EXPECT_EQ(CMReturnObjectPath(broker_.result(), path_).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMReturnDone(broker_.result()).rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(broker_.returnedPaths(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 0);
}

TEST(FaultSweep, A_sweep_ends_when_there_are_fewer_calls_than_n) {
    // This provider looks at no result, so a missing instance makes it misuse the broker.
    unsigned sweeps = 0;
    unsigned withViolations = 0;
    for (unsigned n = 1;; ++n) {
        RecordingBroker broker;
        CMPIInstanceMI* const mi =
            CSample_Create_InstanceMI(broker.get(), broker.context(), nullptr);
        const CMPIObjectPath* const path = broker.makePath("n", "C");
        broker.failCall(n, Fault::nullHandle());
        broker.run([&](const CMPIContext* ctx, const CMPIResult* rslt) {
            return mi->ft->enumerateInstances(mi, ctx, rslt, path, nullptr);
        });
        if (!broker.faultHit()) {
            break;
        }
        ++sweeps;
        withViolations += broker.violations().empty() ? 0 : 1;
    }
    EXPECT_EQ(sweeps, 6u);
    EXPECT_EQ(withViolations, 1u);
}

} // namespace

} // namespace qelo::test
