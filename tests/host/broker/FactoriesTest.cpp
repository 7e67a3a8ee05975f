// The broker's factories and services around objects.
#include "BrokerFixture.h"

#include <cstring>
#include <ctime>

namespace qelo::broker::testing {
namespace {

class FactoriesTest : public BrokerTest {
protected:
    const CMPIBrokerEncFT& eft() { return *mb()->eft; }
};

TEST_F(FactoriesTest, The_broker_presents_itself_as_version_200_with_what_it_can_do) {
    EXPECT_EQ(mb()->bft->brokerVersion, 200);
    EXPECT_STREQ(mb()->bft->brokerName, "qelosim");
    EXPECT_EQ(mb()->bft->brokerCapabilities,
              0x1U | 0x3U | 0x7U | 0x9U | 0x100U | 0x4000U | 0x8000U);
    EXPECT_EQ(eft().ftVersion, 200);
    EXPECT_EQ(mb()->xft->ftVersion, 200);
}

TEST_F(FactoriesTest, No_slot_of_the_broker_tables_is_empty) {
    const auto countEmpty = [](const void* table, std::size_t first, std::size_t size) {
        std::size_t empty = 0;
        for (std::size_t at = first; at < size; at += sizeof(void*)) {
            const void* slot = nullptr;
            std::memcpy(&slot, static_cast<const char*>(table) + at, sizeof slot);
            empty += slot ? 0 : 1;
        }
        return empty;
    };
    EXPECT_EQ(countEmpty(mb()->bft, 8, sizeof *mb()->bft), 0U);
    EXPECT_EQ(countEmpty(mb()->eft, 8, sizeof *mb()->eft), 0U);
    EXPECT_EQ(countEmpty(mb()->xft, 8, sizeof *mb()->xft), 0U);
    EXPECT_EQ(countEmpty(mb()->mft, 8, sizeof *mb()->mft), 0U);
    EXPECT_EQ(countEmpty(instance()->ft, 8, sizeof *instance()->ft), 0U);
    EXPECT_EQ(countEmpty(path()->ft, 8, sizeof *path()->ft), 0U);
    EXPECT_EQ(countEmpty(args()->ft, 8, sizeof *args()->ft), 0U);
    EXPECT_EQ(countEmpty(string("")->ft, 8, sizeof *string("")->ft), 0U);
    EXPECT_EQ(countEmpty(array(0, CMPI_uint8)->ft, 8, sizeof *array(0, CMPI_uint8)->ft), 0U);
    EXPECT_EQ(countEmpty(context()->ft, 8, sizeof *context()->ft), 0U);
}

TEST_F(FactoriesTest, Every_factory_refuses_a_bad_broker) {
    const CMPIObjectPath* op = path();
    CMPIBroker dead = *mb();
    dead.hdl = nullptr;
    for (const CMPIBroker* bad :
         {static_cast<const CMPIBroker*>(nullptr), static_cast<const CMPIBroker*>(&dead)}) {
        EXPECT_EQ(eft().newInstance(bad, op, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newObjectPath(bad, "root", "C", &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newArgs(bad, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newString(bad, "x", &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newArray(bad, 1, CMPI_uint8, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newDateTime(bad, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newDateTimeFromBinary(bad, 0, 0, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newDateTimeFromChars(bad, "20240101000000.000000+000", &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newSelectExp(bad, "q", "CQL", nullptr, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_FALSE(eft().classPathIsA(bad, op, "C", &st));
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().toString(bad, op, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_FALSE(eft().isOfType(bad, op, "CMPIString", &st));
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().getType(bad, op, &st), nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().newCMPIError(bad, "o", "i", "m", ErrorSevLow, ErrorProbCauseOther,
                                     CMPI_RC_ERR_FAILED, &st),
                  nullptr);
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().logMessage(bad, CMPI_SEV_INFO, "i", "t", nullptr).rc,
                  CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().trace(bad, CMPI_LEV_INFO, "c", "t", nullptr).rc,
                  CMPI_RC_ERR_INVALID_HANDLE);
        CMPIMsgFileHandle handle = nullptr;
        EXPECT_EQ(eft().openMessageFile(bad, "f", &handle).rc, CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(eft().closeMessageFile(bad, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    }
}

TEST_F(FactoriesTest, A_success_writes_the_whole_status_and_needs_none) {
    ASSERT_NE(eft().newString(mb(), "x", &st), nullptr);
    EXPECT_EQ(st.rc, CMPI_RC_OK);
    EXPECT_EQ(st.msg, nullptr);
    EXPECT_NE(eft().newString(mb(), "x", nullptr), nullptr);
}

TEST_F(FactoriesTest, A_string_is_a_copy_whose_handle_is_its_text) {
    char source[] = "grün";
    const CMPIString* made = eft().newString(mb(), source, &st);
    source[0] = 'X';
    EXPECT_EQ(text(made), "grün");
    EXPECT_STREQ(static_cast<const char*>(made->hdl), "grün");
    EXPECT_NE(string("")->hdl, nullptr);
    EXPECT_EQ(text(string("")), "");
    EXPECT_EQ(eft().newString(mb(), nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(FactoriesTest, A_path_needs_a_namespace_and_a_class_name_which_may_be_empty) {
    EXPECT_EQ(eft().newObjectPath(mb(), nullptr, "C", &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(eft().newObjectPath(mb(), "root", nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    const CMPIObjectPath* empty = eft().newObjectPath(mb(), "", "", &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(empty->ft->getClassName(empty, nullptr)), "");
}

TEST_F(FactoriesTest, An_instance_needs_a_path_and_starts_without_properties) {
    EXPECT_EQ(eft().newInstance(mb(), nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    const CMPIInstance* made = eft().newInstance(mb(), path(), &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(made->ft->getPropertyCount(made, nullptr), 0U);
}

TEST_F(FactoriesTest, Times_come_from_text_binary_and_the_clock) {
    const CMPIDateTime* point = eft().newDateTimeFromChars(mb(), "20240229120000.000001+060", &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(point->ft->getBinaryFormat(point, &st), 1709204400000001ULL);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(point->ft->getStringFormat(point, &st)), "20240229120000.000001+060");
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_FALSE(point->ft->isInterval(point, &st));
    EXPECT_EQ(rc(), CMPI_RC_OK);

    const CMPIDateTime* interval = eft().newDateTimeFromBinary(mb(), 90'000'000'000ULL, 1, &st);
    EXPECT_EQ(text(interval->ft->getStringFormat(interval, nullptr)), "00000001010000.000000:000");
    EXPECT_TRUE(interval->ft->isInterval(interval, nullptr));
    EXPECT_EQ(interval->ft->getBinaryFormat(interval, nullptr), 90'000'000'000ULL);

    const CMPIDateTime* now = eft().newDateTime(mb(), &st);
    const auto seconds = static_cast<CMPIUint64>(std::time(nullptr));
    const CMPIUint64 clock = now->ft->getBinaryFormat(now, nullptr) / 1'000'000;
    EXPECT_LE(clock > seconds ? clock - seconds : seconds - clock, 5U);
}

TEST_F(FactoriesTest, Text_that_is_no_time_is_refused) {
    for (const char* bad : {"", "now", "2024", "20241301000000.000000+000",
                            "20240101000000.000000+0000", "20240101000000.000000 000"}) {
        EXPECT_EQ(eft().newDateTimeFromChars(mb(), bad, &st), nullptr) << bad;
        EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER) << bad;
    }
    EXPECT_EQ(eft().newDateTimeFromChars(mb(), nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(FactoriesTest, A_time_beyond_what_the_text_can_hold_is_refused) {
    EXPECT_EQ(eft().newDateTimeFromBinary(mb(), UINT64_MAX, 0, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(eft().newDateTimeFromBinary(mb(), UINT64_MAX, 1, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    const CMPIDateTime* last =
        eft().newDateTimeFromBinary(mb(), 253'402'300'799'999'999ULL, 0, &st);
    ASSERT_NE(last, nullptr);
    EXPECT_EQ(text(last->ft->getStringFormat(last, nullptr)), "99991231235959.999999+000");
}

TEST_F(FactoriesTest, Queries_are_not_supported) {
    CMPIArray* projection = array(1, CMPI_string);
    EXPECT_EQ(eft().newSelectExp(mb(), "SELECT * FROM X", "CQL", &projection, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(projection, nullptr);
}

TEST_F(FactoriesTest, Class_membership_comes_from_the_schema) {
    hooks.schema.isA = [](const std::string&, const std::string& sub, const std::string& super) {
        return sub == "TEST_Thing" && super == "CIM_Base";
    };
    EXPECT_TRUE(eft().classPathIsA(mb(), path(), "CIM_Base", &st));
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_TRUE(eft().classPathIsA(mb(), path(), "test_THING", &st));
    EXPECT_FALSE(eft().classPathIsA(mb(), path(), "CIM_Other", &st));
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_FALSE(eft().classPathIsA(mb(), path(), "", &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_FALSE(eft().classPathIsA(mb(), path(), nullptr, &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_FALSE(eft().classPathIsA(mb(), nullptr, "CIM_Base", &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(FactoriesTest, A_class_that_the_schema_does_not_know_is_not_found) {
    hooks.schema.hasClass = [](const std::string&, const std::string& name) {
        return name == "CIM_Base";
    };
    EXPECT_FALSE(eft().classPathIsA(mb(), path(), "CIM_Base", &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(FactoriesTest, Objects_are_described_for_people) {
    CMPIInstance* inst = instance();
    CMPIArray* numbers = array(2, CMPI_uint16);
    CMPIValue value = {};
    value.uint16 = 5;
    numbers->ft->setElementAt(numbers, 0, &value, CMPI_uint16);
    value = {};
    value.array = numbers;
    inst->ft->setProperty(inst, "Numbers", &value, CMPI_uint16A);
    inst->ft->setProperty(inst, "Color", chars("red"), CMPI_chars);
    inst->ft->setProperty(inst, "Nothing", nullptr, CMPI_uint8);
    EXPECT_EQ(text(eft().toString(mb(), inst, nullptr)),
              "root/test:TEST_Thing { Numbers={5,}; Color=\"red\"; Nothing=NULL; }");
    EXPECT_EQ(text(eft().toString(mb(), numbers, nullptr)), "{5, NULL}");
    EXPECT_EQ(text(eft().toString(mb(), string("abc"), nullptr)), "abc");
    EXPECT_EQ(eft().toString(mb(), nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(FactoriesTest, An_unknown_type_name_is_refused) {
    EXPECT_FALSE(eft().isOfType(mb(), string("x"), "CMPIThing", &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_FALSE(eft().isOfType(mb(), string("x"), nullptr, &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_FALSE(eft().isOfType(mb(), nullptr, "CMPIString", &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    int other[4] = {};
    EXPECT_FALSE(eft().isOfType(mb(), other, "CMPIString", &st));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(FactoriesTest, Messages_of_providers_reach_the_hosts_log) {
    std::vector<std::string> lines;
    hooks.log.log = [&](int severity, const std::string& id, const std::string& line) {
        lines.push_back("log " + std::to_string(severity) + " " + id + " " + line);
    };
    hooks.log.trace = [&](int level, const std::string& component, const std::string& line) {
        lines.push_back("trace " + std::to_string(level) + " " + component + " " + line);
    };
    EXPECT_EQ(eft().logMessage(mb(), CMPI_SEV_ERROR, "ID1", "text", string("unused")).rc,
              CMPI_RC_OK);
    EXPECT_EQ(eft().logMessage(mb(), CMPI_SEV_INFO, nullptr, nullptr, string("other")).rc,
              CMPI_RC_OK);
    EXPECT_EQ(eft().trace(mb(), CMPI_LEV_VERBOSE, "comp", "text", nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(eft().trace(mb(), CMPI_LEV_INFO, nullptr, nullptr, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(lines, (std::vector<std::string>{"log 1 ID1 text", "log 2  other",
                                               "trace 3 comp text", "trace 1  "}));
}

TEST_F(FactoriesTest, Without_hooks_logs_go_to_standard_error_on_one_line_and_traces_nowhere) {
    ::testing::internal::CaptureStderr();
    eft().logMessage(mb(), CMPI_SEV_ERROR, "ID1", "two\nlines", nullptr);
    eft().trace(mb(), CMPI_LEV_INFO, "c", "unseen", nullptr);
    EXPECT_EQ(::testing::internal::GetCapturedStderr(), "ID1: two lines\n");
}

TEST_F(FactoriesTest, A_hook_that_throws_becomes_a_status) {
    hooks.log.log = [](int, const std::string&, const std::string&) {
        throw std::runtime_error("disk full");
    };
    const CMPIStatus status = eft().logMessage(mb(), CMPI_SEV_ERROR, "i", "t", nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(text(status.msg), "disk full");
}

TEST_F(FactoriesTest, Lack_of_memory_becomes_a_status) {
    hooks.schema.isA = [](const std::string&, const std::string&, const std::string&) -> bool {
        throw std::bad_alloc();
    };
    EXPECT_FALSE(eft().classPathIsA(mb(), path(), "CIM_Base", &st));
    EXPECT_EQ(st.msg, nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_FAILED);
}

} // namespace
} // namespace qelo::broker::testing
