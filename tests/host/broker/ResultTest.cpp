// What a provider puts into its result.
#include "BrokerFixture.h"

#include <broker/Result.h>

#include <stdexcept>

namespace qelo::broker::testing {
namespace {

using Kind = ResultObject::Kind;

class ResultTest : public BrokerTest {
protected:
    std::unique_ptr<ResultObject> make(Kind kind) {
        auto result = std::make_unique<ResultObject>(kind);
        result->nameSpace = "root/default";
        result->instanceSink = [this](const cim::Instance& inst) { instances.push_back(inst); };
        result->pathSink = [this](const cim::ObjectPath& op) { paths.push_back(op); };
        return result;
    }
    CMPIInstance* red() {
        CMPIInstance* inst = instance();
        inst->ft->setProperty(inst, "Color", chars("red"), CMPI_chars);
        inst->ft->setProperty(inst, "Size", chars("big"), CMPI_chars);
        return inst;
    }
    std::vector<cim::Instance> instances;
    std::vector<cim::ObjectPath> paths;
};

TEST_F(ResultTest, An_instance_is_taken_at_once) {
    const auto result = make(Kind::Instances);
    CMPIInstance* inst = red();
    EXPECT_EQ(CMReturnInstance(&result->cmpi, inst).rc, CMPI_RC_OK);
    inst->ft->setProperty(inst, "Color", chars("blue"), CMPI_chars);
    EXPECT_EQ(CMReturnInstance(&result->cmpi, inst).rc, CMPI_RC_OK);
    ASSERT_EQ(instances.size(), 2U);
    EXPECT_EQ(instances[0].property("Color")->asString(), "red");
    EXPECT_EQ(instances[1].property("Color")->asString(), "blue");
}

// What is delivered is filled again for the next one.
TEST_F(ResultTest, Instances_of_any_shape_follow_each_other) {
    const auto result = make(Kind::Instances);
    CMPIValue number = uint32Value(5);
    std::vector<CMPIInstance*> made = {red(), instance(), red(), instance()};
    made[1]->ft->setProperty(made[1], "Length", &number, CMPI_uint32);
    made[2]->ft->setPropertyWithOrigin(made[2], "Color", nullptr, CMPI_string, "TEST_Base");
    CMPIValue array = {};
    array.array = mb()->eft->newArray(mb(), 2, CMPI_string, nullptr);
    made[3]->ft->setProperty(made[3], "Color", &array, CMPI_stringA);
    CMPIObjectPath* other = mb()->eft->newObjectPath(mb(), "root/other", "TEST_Other", nullptr);
    other->ft->addKey(other, "Id", chars("7"), CMPI_chars);
    made[3]->ft->setObjectPath(made[3], other);
    made.push_back(red());
    for (CMPIInstance* inst : made) {
        EXPECT_EQ(CMReturnInstance(&result->cmpi, inst).rc, CMPI_RC_OK);
    }
    ASSERT_EQ(instances.size(), made.size());
    for (std::size_t i = 0; i < made.size(); ++i) {
        const cim::Instance alone = toCim(*liveObject<InstanceObject>(made[i]));
        EXPECT_EQ(instances[i], alone) << i;
        EXPECT_EQ(instances[i].path().nameSpace(), alone.path().nameSpace()) << i;
    }
    EXPECT_EQ(instances[1].properties().size(), 1U);
    EXPECT_EQ(instances[2].properties()[0].origin, "TEST_Base");
    EXPECT_TRUE(instances[2].properties()[0].value.isNull());
    EXPECT_TRUE(instances[3].properties()[0].value.isArray());
    EXPECT_EQ(instances[3].properties()[0].origin, "");
    EXPECT_EQ(instances[3].path().toText(), "root/other:TEST_Other.Id=\"7\"");
    EXPECT_TRUE(instances[4].path().keys().empty());
    EXPECT_EQ(instances[4].property("Size")->asString(), "big");
}

TEST_F(ResultTest, Only_wanted_properties_are_delivered) {
    const auto result = make(Kind::Instances);
    result->properties = std::vector<std::string>{"SIZE"};
    CMReturnInstance(&result->cmpi, red());
    ASSERT_EQ(instances.at(0).properties().size(), 1U);
    EXPECT_EQ(instances[0].properties()[0].name, "Size");
}

TEST_F(ResultTest, A_path_without_namespace_gets_the_requests) {
    const auto result = make(Kind::Paths);
    CMPIObjectPath* op = mb()->eft->newObjectPath(mb(), "", "TEST_Thing", nullptr);
    EXPECT_EQ(CMReturnObjectPath(&result->cmpi, op).rc, CMPI_RC_OK);
    EXPECT_EQ(paths.at(0).nameSpace(), "root/default");
    EXPECT_EQ(CMReturnObjectPath(&result->cmpi, path()).rc, CMPI_RC_OK);
    EXPECT_EQ(paths.at(1).nameSpace(), "root/test");
}

TEST_F(ResultTest, What_does_not_belong_into_the_operation_is_refused) {
    const auto names = make(Kind::Paths);
    EXPECT_EQ(CMReturnInstance(&names->cmpi, red()).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(CMReturnData(&names->cmpi, "x", CMPI_chars).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    const auto all = make(Kind::Instances);
    EXPECT_EQ(CMReturnObjectPath(&all->cmpi, path()).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    const auto none = make(Kind::Nothing);
    EXPECT_EQ(CMReturnInstance(&none->cmpi, red()).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(CMReturnObjectPath(&none->cmpi, path()).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_TRUE(instances.empty());
    EXPECT_TRUE(paths.empty());
}

TEST_F(ResultTest, Instances_and_paths_may_come_as_data) {
    const auto all = make(Kind::Instances);
    CMPIValue value = {};
    value.inst = red();
    EXPECT_EQ(CMReturnData(&all->cmpi, &value, CMPI_instance).rc, CMPI_RC_OK);
    const auto names = make(Kind::Paths);
    value.ref = path();
    EXPECT_EQ(CMReturnData(&names->cmpi, &value, CMPI_ref).rc, CMPI_RC_OK);
    EXPECT_EQ(instances.size(), 1U);
    EXPECT_EQ(paths.size(), 1U);
}

TEST_F(ResultTest, A_method_returns_one_value_of_any_kind) {
    const CMPIValue number = uint32Value(5);
    const auto plain = make(Kind::Value);
    EXPECT_EQ(CMReturnData(&plain->cmpi, &number, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(*plain->value, cim::Value::unsignedInteger(cim::Type::UInt32, 5));
    EXPECT_EQ(CMReturnData(&plain->cmpi, &number, CMPI_uint32).rc, CMPI_RC_ERR_FAILED);
    const auto embedded = make(Kind::Value);
    EXPECT_EQ(CMReturnInstance(&embedded->cmpi, red()).rc, CMPI_RC_OK);
    EXPECT_EQ(embedded->value->asInstance().property("Color")->asString(), "red");
    const auto reference = make(Kind::Value);
    EXPECT_EQ(CMReturnObjectPath(&reference->cmpi, path()).rc, CMPI_RC_OK);
    EXPECT_EQ(reference->value->asReference().className(), "TEST_Thing");
    const auto null = make(Kind::Value);
    EXPECT_EQ(CMReturnData(&null->cmpi, nullptr, CMPI_uint8).rc, CMPI_RC_OK);
    EXPECT_TRUE(null->value->isNull());
    const auto bad = make(Kind::Value);
    EXPECT_EQ(CMReturnData(&bad->cmpi, &number, CMPI_args).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_F(ResultTest, Done_may_come_twice_but_nothing_after_it) {
    const auto result = make(Kind::Instances);
    EXPECT_EQ(CMReturnDone(&result->cmpi).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnDone(&result->cmpi).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(&result->cmpi, red()).rc, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(instances.empty());
}

TEST_F(ResultTest, The_first_error_object_counts) {
    const auto result = make(Kind::Instances);
    const auto error = [&](const char* message) {
        return mb()->eft->newCMPIError(mb(), "us", "id", message, ErrorSevLow, ErrorProbCauseOther,
                                       CMPI_RC_ERR_NOT_FOUND, nullptr);
    };
    EXPECT_EQ(result->cmpi.ft->returnError(&result->cmpi, error("first")).rc, CMPI_RC_OK);
    EXPECT_EQ(result->cmpi.ft->returnError(&result->cmpi, error("second")).rc, CMPI_RC_OK);
    ASSERT_TRUE(result->error.has_value());
    EXPECT_STREQ(result->error->what(), "first");
    EXPECT_EQ(result->cmpi.ft->returnError(&result->cmpi, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(ResultTest, A_sink_that_throws_ends_the_request) {
    const auto result = make(Kind::Instances);
    result->instanceSink = [](const cim::Instance&) { throw std::runtime_error("pipe closed"); };
    EXPECT_EQ(CMReturnInstance(&result->cmpi, red()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMReturnInstance(&result->cmpi, red()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(CMReturnDone(&result->cmpi).rc, CMPI_RC_ERR_INVALID_HANDLE);
    ASSERT_TRUE(result->sinkFailure);
    EXPECT_THROW(std::rethrow_exception(result->sinkFailure), std::runtime_error);
}

TEST_F(ResultTest, It_refuses_null_and_dead_objects_and_cannot_be_cloned) {
    const auto result = make(Kind::Instances);
    const CMPIResultFT* ft = result->cmpi.ft;
    EXPECT_EQ(ft->ftVersion, 200);
    EXPECT_EQ(ft->returnInstance(&result->cmpi, nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->returnInstance(nullptr, red()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->returnObjectPath(nullptr, path()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->returnData(nullptr, nullptr, CMPI_uint8).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->returnDone(nullptr).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->clone(&result->cmpi, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(ft->clone(nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(ft->release(&result->cmpi).rc, CMPI_RC_OK);
    EXPECT_EQ(CMReturnInstance(&result->cmpi, red()).rc, CMPI_RC_OK);
    EXPECT_EQ(text(mb()->eft->getType(mb(), &result->cmpi, nullptr)), "CMPIResult");
}

} // namespace
} // namespace qelo::broker::testing
