// What a provider asks of the object manager: the arguments reach the router, the answers
// come back as objects of the provider's call, and failures as statuses.
#include "BrokerFixture.h"

namespace qelo::broker::testing {
namespace {

cim::Instance redThing() {
    cim::ObjectPath path("root/test", "TEST_Thing");
    path.setKey("Name", cim::Value::string("one"));
    cim::Instance instance(path);
    instance.setProperty("Color", cim::Value::string("red"));
    return instance;
}

class UpCallTest : public BrokerTest {
protected:
    void SetUp() override {
        router.instances = {redThing()};
        router.paths = {redThing().path()};
        router.methodResult = {cim::Value::unsignedInteger(cim::Type::UInt32, 7),
                               {{"Out", cim::Value::string("filled")}}};
    }
    const CMPIBrokerFT& bft() { return *mb()->bft; }
    const char* properties_[3] = {"Color", "Size", nullptr};
    const client::PropertyList colorAndSize_ = std::vector<std::string>{"Color", "Size"};

    void expectRed(const CMPIEnumeration* en) {
        ASSERT_EQ(rc(), CMPI_RC_OK);
        ASSERT_TRUE(en->ft->hasNext(en, nullptr));
        const CMPIData data = en->ft->getNext(en, nullptr);
        ASSERT_EQ(data.type, CMPI_instance);
        const CMPIInstance* inst = data.value.inst;
        EXPECT_EQ(text(inst->ft->getProperty(inst, "Color", nullptr).value.string), "red");
        EXPECT_FALSE(en->ft->hasNext(en, nullptr));
    }
    void expectPath(const CMPIEnumeration* en) {
        ASSERT_EQ(rc(), CMPI_RC_OK);
        const CMPIData data = en->ft->getNext(en, nullptr);
        ASSERT_EQ(data.type, CMPI_ref);
        EXPECT_EQ(text(data.value.ref->ft->toString(data.value.ref, nullptr)),
                  "root/test:TEST_Thing.Name=\"one\"");
    }
};

TEST_F(UpCallTest, The_callers_context_goes_along) {
    const CMPIContext* ctx = context({"alice", "admin", "de", "en", 4});
    bft().enumerateInstanceNames(mb(), ctx, path(), &st);
    EXPECT_EQ(router.context.principal, "alice");
    EXPECT_EQ(router.context.role, "admin");
    EXPECT_EQ(router.context.acceptLanguage, "de");
    EXPECT_EQ(router.context.contentLanguage, "en");
    EXPECT_EQ(router.context.invocationFlags, 4U);
    EXPECT_EQ(router.path.className(), "TEST_Thing");
    EXPECT_EQ(router.path.nameSpace(), "root/test");
}

TEST_F(UpCallTest, Enumerations_bring_paths_and_instances) {
    expectPath(bft().enumerateInstanceNames(mb(), context(), path(), &st));
    expectRed(bft().enumerateInstances(mb(), context(), path(), properties_, &st));
    EXPECT_EQ(router.properties, colorAndSize_);
    expectRed(bft().enumerateInstances(mb(), context(), path(), nullptr, &st));
    EXPECT_FALSE(router.properties.has_value());
}

TEST_F(UpCallTest, An_empty_enumeration_is_a_success) {
    router.paths.clear();
    const CMPIEnumeration* en = bft().enumerateInstanceNames(mb(), context(), path(), &st);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    ASSERT_NE(en, nullptr);
    EXPECT_FALSE(en->ft->hasNext(en, nullptr));
}

TEST_F(UpCallTest, One_instance_is_fetched) {
    const CMPIInstance* inst = bft().getInstance(mb(), context(), path(), properties_, &st);
    ASSERT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(inst->ft->getProperty(inst, "Color", nullptr).value.string), "red");
    EXPECT_EQ(router.properties, colorAndSize_);
}

TEST_F(UpCallTest, Instances_are_created_modified_and_deleted) {
    CMPIInstance* inst = instance();
    inst->ft->setProperty(inst, "Color", chars("green"), CMPI_chars);
    const CMPIObjectPath* made = bft().createInstance(mb(), context(), path(), inst, &st);
    ASSERT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(text(made->ft->getKey(made, "Name", nullptr).value.string), "one");
    EXPECT_EQ(router.instance.property("Color")->asString(), "green");
    EXPECT_EQ(bft().modifyInstance(mb(), context(), path(), inst, properties_).rc, CMPI_RC_OK);
    EXPECT_EQ(router.properties, colorAndSize_);
    EXPECT_EQ(bft().deleteInstance(mb(), context(), path()).rc, CMPI_RC_OK);
    EXPECT_EQ(router.calls,
              (std::vector<std::string>{"createInstance", "modifyInstance", "deleteInstance"}));
    EXPECT_EQ(bft().createInstance(mb(), context(), path(), nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().modifyInstance(mb(), context(), path(), nullptr, nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(UpCallTest, A_query_needs_text_and_language) {
    expectRed(bft().execQuery(mb(), context(), path(), "SELECT", "WQL", &st));
    EXPECT_EQ(router.text, "WQL: SELECT");
    EXPECT_EQ(bft().execQuery(mb(), context(), path(), nullptr, "WQL", &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_QUERY);
    EXPECT_EQ(bft().execQuery(mb(), context(), path(), "SELECT", nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
}

TEST_F(UpCallTest, Association_operations_pass_their_filters) {
    expectRed(bft().associators(mb(), context(), path(), "A", "R", "r1", "r2", properties_, &st));
    EXPECT_EQ(router.filter.assocClass, "A");
    EXPECT_EQ(router.filter.resultClass, "R");
    EXPECT_EQ(router.filter.role, "r1");
    EXPECT_EQ(router.filter.resultRole, "r2");
    expectPath(
        bft().associatorNames(mb(), context(), path(), nullptr, nullptr, nullptr, "r2", &st));
    EXPECT_EQ(router.filter.assocClass, "");
    EXPECT_EQ(router.filter.resultRole, "r2");
    expectRed(bft().references(mb(), context(), path(), "A", "r1", nullptr, &st));
    EXPECT_EQ(router.filter.resultClass, "A");
    EXPECT_EQ(router.filter.role, "r1");
    expectPath(bft().referenceNames(mb(), context(), path(), "B", nullptr, &st));
    EXPECT_EQ(router.filter.resultClass, "B");
    EXPECT_EQ(router.filter.role, "");
}

TEST_F(UpCallTest, A_method_gets_its_input_and_fills_its_output) {
    CMPIArgs* in = args();
    in->ft->addArg(in, "In", chars("given"), CMPI_chars);
    CMPIArgs* out = args();
    const CMPIData result = bft().invokeMethod(mb(), context(), path(), "Do", in, out, &st);
    ASSERT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(result.type, CMPI_uint32);
    EXPECT_EQ(result.value.uint32, 7U);
    EXPECT_EQ(text(out->ft->getArg(out, "Out", nullptr).value.string), "filled");
    EXPECT_EQ(router.text, "Do");
    EXPECT_EQ(router.arguments.at(0).first, "In");
    EXPECT_EQ(bft().invokeMethod(mb(), context(), path(), "Do", nullptr, nullptr, &st).value.uint32,
              7U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    bft().invokeMethod(mb(), context(), path(), nullptr, in, out, &st);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(UpCallTest, Single_properties_are_set_and_read) {
    const CMPIValue value = uint32Value(3);
    EXPECT_EQ(bft().setProperty(mb(), context(), path(), "P", &value, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(router.value, cim::Value::unsignedInteger(cim::Type::UInt32, 3));
    EXPECT_EQ(bft().getProperty(mb(), context(), path(), "P", &st).value.uint32, 3U);
    EXPECT_EQ(rc(), CMPI_RC_OK);
    EXPECT_EQ(bft().setProperty(mb(), context(), path(), "P", nullptr, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_TRUE(router.value.isNull());
    EXPECT_EQ(bft().setProperty(mb(), context(), path(), nullptr, &value, CMPI_uint32).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_TRUE(isNull(bft().getProperty(mb(), context(), path(), "", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(UpCallTest, Indications_are_handed_on) {
    EXPECT_EQ(bft().deliverIndication(mb(), context(), "root/test", instance()).rc, CMPI_RC_OK);
    EXPECT_EQ(router.text, "root/test");
    EXPECT_EQ(bft().deliverIndication(mb(), context(), nullptr, instance()).rc,
              CMPI_RC_ERR_INVALID_NAMESPACE);
    EXPECT_EQ(bft().deliverIndication(mb(), context(), "root", nullptr).rc,
              CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(UpCallTest, A_failure_comes_back_with_code_and_message) {
    router.failure = std::make_unique<client::CimError>(6U, "no such thing");
    EXPECT_EQ(bft().getInstance(mb(), context(), path(), nullptr, &st), nullptr);
    EXPECT_EQ(st.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(text(st.msg), "no such thing");
    EXPECT_EQ(bft().deleteInstance(mb(), context(), path()).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_TRUE(isNull(bft().invokeMethod(mb(), context(), path(), "Do", nullptr, nullptr, &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(UpCallTest, Bad_contexts_paths_and_brokers_are_refused_before_anything_is_asked) {
    EXPECT_EQ(bft().enumerateInstanceNames(mb(), nullptr, path(), &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().enumerateInstances(mb(), context(), nullptr, nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().getInstance(nullptr, context(), path(), nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().associators(mb(), context(), nullptr, nullptr, nullptr, nullptr, nullptr,
                                nullptr, &st),
              nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().associatorNames(mb(), nullptr, path(), nullptr, nullptr, nullptr, nullptr, &st),
              nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().references(mb(), nullptr, path(), nullptr, nullptr, nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().referenceNames(mb(), nullptr, path(), nullptr, nullptr, &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().deleteInstance(mb(), nullptr, path()).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(bft().execQuery(mb(), nullptr, path(), "q", "l", &st), nullptr);
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_TRUE(isNull(bft().getProperty(mb(), nullptr, path(), "P", &st)));
    EXPECT_EQ(rc(), CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_TRUE(router.calls.empty());
}

} // namespace
} // namespace qelo::broker::testing
