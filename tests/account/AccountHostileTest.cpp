// Account data, brokers and stores that mean harm or break down.
#include "AccountFixture.h"

#include <algorithm>
#include <thread>

namespace qelo::test {
namespace {

using namespace Tesk::NodeLexicon;
using testing::ElementsAre;
using testing::IsEmpty;

class HostileAccounts : public AccountFixture {};

// ---- data ----

const std::vector<std::string>& hostileNames() {
    static const std::vector<std::string> names = {
        std::string(600, 'a'),     std::string(100000, 'b'),
        "%s%s%s%n%n%n%d%x",        "new\nline",
        "quote\"'`$(reboot)",      "a,b:c",
        "\xFF\xFE bad UTF-8 \xC3", "\x1b[31mred",
        "../../etc/shadow",        " ",
    };
    return names;
}

TEST_F(HostileAccounts, Names_are_served_unchanged_with_every_line_traced) {
    std::vector<StoreNode> nodes;
    for (const std::string& name : hostileNames()) {
        nodes.push_back(fullAccountNode(name));
    }
    serve(nodes);
    expectSuccess(enumInstances());
    EXPECT_THAT(returnedNames(), testing::UnorderedElementsAreArray(hostileNames()));
    expectSuccess(enumNames());
    EXPECT_THAT(returnedNames(), testing::UnorderedElementsAreArray(hostileNames()));
    EXPECT_GT(platform_.lineCount(), 0U);
}

TEST_F(HostileAccounts, Each_can_be_looked_up) {
    for (const std::string& name : hostileNames()) {
        platform_.reset();
        serve({fullAccountNode(name)});
        expectSuccess(getInstance(accountKeys(name)));
        EXPECT_THAT(returnedNames(), ElementsAre(name));
    }
}

TEST_F(HostileAccounts, No_line_is_longer_than_511_characters) {
    serve({fullAccountNode(std::string(600, 'a'))});
    enumInstances();
    enumNames();
    std::size_t longest = 0;
    for (const LogLine& line : platform_.lines()) {
        longest = std::max(longest, line.message.size());
    }
    EXPECT_EQ(longest, 511U);
}

TEST_F(HostileAccounts, Every_text_may_have_600_characters) {
    StoreNode node = fullAccountNode("alice");
    for (auto& [id, value] : node.properties) {
        if (std::holds_alternative<std::string>(value)) {
            value = std::string(600, 'x');
        }
    }
    serve({node});
    expectSuccess(enumInstances());
    EXPECT_EQ(onlyInstance().propertyText("UserID"), std::string(600, 'x'));
}

TEST_F(HostileAccounts, A_name_of_600_characters_may_be_asked_for_in_vain) {
    serve({accountNode("alice")});
    expectSuccess(getInstance(accountKeys(std::string(600, 'a'))));
    EXPECT_EQ(broker_.doneCount(), 0);
}

TEST_F(HostileAccounts, A_status_text_of_any_length_is_traced_within_bounds) {
    serve({accountNode("alice")});
    platform_.setCommandStatus(std::string(5000, 's'));
    expectSuccess(invoke(std::string(5000, 'm').c_str(), broker_.makeArgs()));
}

TEST_F(HostileAccounts, A_list_of_100000_property_names_ends) {
    broker_.ignorePropertyFilter(true);
    serve({fullAccountNode("alice")});
    std::vector<const char*> names(100000, "Unknown");
    expectSuccess(enumInstances(names));
    EXPECT_EQ(onlyInstance().properties.size(), 4U);
}

// ---- requests ----

TEST_F(HostileAccounts, A_request_path_without_namespace_is_served) {
    serve({accountNode("alice")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        broker_.clearFaults();
        broker_.failSlot("getNameSpace", 0, fault);
        enumNames();
        EXPECT_THAT(returnedNames(), ElementsAre("alice"));
        enumInstances();
        EXPECT_THAT(returnedNames(), ElementsAre("alice"));
        getInstance(accountKeys("alice"));
        EXPECT_THAT(returnedNames(), ElementsAre("alice"));
    }
}

TEST_F(HostileAccounts, A_class_name_that_cannot_be_read_runs_nothing) {
    serve({accountNode("alice")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        broker_.clearFaults();
        broker_.failSlot("getClassName", 0, fault);
        invoke("Method", broker_.makeArgs());
        EXPECT_THAT(platform_.commands(), IsEmpty());
    }
}

// ---- broker ----

TEST_F(HostileAccounts, A_null_instance_is_passed_over) {
    serve({accountNode("alice"), accountNode("bob"), accountNode("carol")});
    broker_.failSlot("newInstance", 2, Fault::null());
    expectSuccess(enumInstances());
    EXPECT_THAT(returnedNames(), ElementsAre("alice", "carol"));
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(HostileAccounts, An_instance_without_a_handle_is_passed_over) {
    serve({accountNode("alice"), accountNode("bob")});
    broker_.failSlot("newInstance", 1, Fault::nullHandle());
    expectSuccess(enumInstances());
    EXPECT_THAT(returnedNames(), ElementsAre("bob"));
}

TEST_F(HostileAccounts, An_instance_whose_path_cannot_be_made_is_passed_over) {
    serve({accountNode("alice"), accountNode("bob")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle()}) {
        broker_.clearFaults();
        broker_.failSlot("newObjectPath", 1, fault);
        expectSuccess(enumInstances());
        EXPECT_THAT(returnedNames(), ElementsAre("bob"));
    }
}

TEST_F(HostileAccounts, The_only_instance_missing_leaves_CMReturnDone_alone) {
    serve({accountNode("alice")});
    broker_.failSlot("newInstance", 1, Fault::null());
    expectSuccess(getInstance(accountKeys("alice")));
    EXPECT_THAT(broker_.returnedInstances(), IsEmpty());
    EXPECT_EQ(broker_.doneCount(), 1);
}

TEST_F(HostileAccounts, A_date_that_the_broker_refuses_is_a_NULL_date) {
    serve({fullAccountNode("alice")});
    for (const Fault& fault : {Fault::null(), Fault::nullHandle(), Fault::error()}) {
        broker_.clearFaults();
        broker_.failSlot("newDateTimeFromChars", 1, fault);
        expectSuccess(enumInstances());
        const Instance instance = onlyInstance();
        EXPECT_EQ(propertyOf(instance, "InactivityTimeout"), Value::nullOf(CMPI_dateTime));
        EXPECT_EQ(instance.propertyText("PasswordExpiration"), "20150408133106.000000+000");
    }
}

TEST_F(HostileAccounts, Arrays_that_the_broker_refuses_spare_the_other_properties) {
    serve({fullAccountNode("alice")});
    broker_.failSlot("newArray", 0, Fault::null());
    expectSuccess(enumInstances());
    EXPECT_EQ(onlyInstance().propertyText("AccountDisable"), "false");
    EXPECT_EQ(onlyInstance().propertyText("UserID"), "1001");
}

std::string operationName(const testing::TestParamInfo<int>& test) {
    static const char* names[] = {"EnumNames", "EnumInstances", "GetInstance", "GetInstanceByPath",
                                  "InvokeMethod"};
    return names[test.param];
}

// Every operation, with a fault at each broker call in turn. The fixture's destructor finds
// what was handed back to the broker although it was null.
class BrokerFaults : public HostileAccounts, public testing::WithParamInterface<int> {
protected:
    void runOne() {
        platform_.forget();
        switch (GetParam()) {
        case 0:
            enumNames();
            break;
        case 1:
            enumInstances();
            break;
        case 2:
            getInstance(accountKeys("alice"));
            break;
        case 3:
            getInstance({{"SystemName", "host.example"}});
            break;
        default:
            invoke("Method", broker_.makeArgs().string("S", "v").uint32("N", 1).dateTime(
                                 "D", "20140307123005.000000+000"));
            break;
        }
    }

    // Sweeps over the calls; returns how many there were.
    unsigned int sweep(const Fault& fault) {
        for (unsigned int n = 1;; ++n) {
            broker_.clearFaults();
            broker_.failCall(n, fault);
            runOne();
            if (!broker_.faultHit()) {
                return n - 1;
            }
            EXPECT_LE(broker_.doneCount(), 1) << "fault at call " << n;
            EXPECT_THAT(broker_.violations(), IsEmpty()) << "fault at call " << n;
            broker_.clearViolations();
        }
    }
};

TEST_P(BrokerFaults, A_fault_at_any_call_is_survived) {
    serve({fullAccountNode("alice"), accountNode("bob")});
    EXPECT_GT(sweep(Fault::null()), 1U);
    EXPECT_GT(sweep(Fault::nullHandle()), 1U);
    EXPECT_GT(sweep(Fault::error(CMPI_RC_ERR_FAILED, "broken")), 1U);
}

INSTANTIATE_TEST_SUITE_P(Operations, BrokerFaults, testing::Range(0, 5), operationName);

// ---- store ----

class StoreFaults : public BrokerFaults {
protected:
    void sweepStore(StoreFault fault) {
        platform_.reset();
        serve({fullAccountNode("alice"), accountNode("bob")});
        platform_.setEntryCount(UserAccount, 9);
        runOne();
        const std::size_t calls = platform_.storeCallCount();
        ASSERT_GT(calls, 1U);
        for (std::size_t n = 1; n <= calls; ++n) {
            platform_.reset();
            serve({fullAccountNode("alice"), accountNode("bob")});
            platform_.setEntryCount(UserAccount, 9);
            platform_.failStoreCall(n, fault);
            EXPECT_NO_THROW(runOne()) << "store call " << n;
            EXPECT_EQ(platform_.openCursors(), 0U) << "store call " << n;
            EXPECT_LE(broker_.doneCount(), 1) << "store call " << n;
        }
    }
};

TEST_P(StoreFaults, Nothing_thrown_leaves_the_operation) {
    sweepStore(StoreFault::ThrowsRuntimeError);
    sweepStore(StoreFault::ThrowsForeign);
    sweepStore(StoreFault::ReturnsFalse);
}

INSTANTIATE_TEST_SUITE_P(Operations, StoreFaults, testing::Range(0, 5), operationName);

TEST_F(HostileAccounts, Requests_on_several_threads_are_each_served_whole) {
    serve({fullAccountNode("alice"), fullAccountNode("bob")});
    constexpr int threadCount = 4;
    constexpr int requests = 25;
    broker_.beginCall();
    std::vector<std::thread> threads;
    for (int i = 0; i < threadCount; ++i) {
        threads.emplace_back([&] {
            for (int n = 0; n < requests; ++n) {
                const RecordingBroker own;
                const CMPIStatus status = instances_->ft->enumerateInstances(
                    instances_, broker_.context(), own.result(), classPath_, nullptr);
                EXPECT_EQ(status.rc, CMPI_RC_OK);
                EXPECT_EQ(own.returnedInstances().size(), 2U);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    broker_.endCall();
    for (const LogLine& line : platform_.lines()) {
        ASSERT_LE(line.message.size(), 511U);
        ASSERT_EQ(line.message.find("Secret-of-the-account"), std::string::npos);
    }
}

TEST_F(HostileAccounts, Something_foreign_that_is_thrown_becomes_a_failed_status) {
    serve({accountNode("alice")});
    platform_.failOperation("selectNode", 2, StoreFault::ThrowsForeign);
    const Outcome outcome = enumInstances();
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(outcome.hasMessage);
    EXPECT_EQ(broker_.doneCount(), 0);
    EXPECT_FALSE(exitMarked());
    EXPECT_THAT(failureTexts(), ElementsAre(outcome.message));
}

} // namespace
} // namespace qelo::test
