#include "SchemaFixture.h"

#include <broker/Dispatcher.h>
#include <broker/Schema.h>

namespace qelo::schema::testing {
namespace {

using ::testing::ElementsAre;

class StaticInstancesTest : public SchemaTest {
protected:
    void SetUp() override {
        read(std::string(standardQualifiers) + R"(
            class Thing { [Key] uint16 Id; string Color; };
            class Gadget : Thing {};
            instance of Thing { Id = 1; Color = "red"; };
            instance of Gadget { Id = 2; Color = "blue"; };)");
        broker::DispatcherOptions options;
        options.hooks.schema =
            broker::schemaHooks(std::make_shared<const ClassRepository>(std::move(repository)));
        dispatcher = std::make_unique<broker::Dispatcher>(std::move(options));
    }

    std::vector<std::string> paths(const char* className) {
        std::vector<std::string> found;
        dispatcher->enumerateInstanceNames(
            {}, cim::ObjectPath(nameSpace, className),
            [&](const cim::ObjectPath& path) { found.push_back(path.toText(false, false)); });
        return found;
    }

    std::unique_ptr<broker::Dispatcher> dispatcher;
};

TEST_F(StaticInstancesTest, They_are_served_for_their_class_and_its_superclasses) {
    EXPECT_THAT(paths("Thing"), ElementsAre("Thing.Id=1", "Gadget.Id=2"));
    EXPECT_THAT(paths("gadget"), ElementsAre("Gadget.Id=2"));
}

TEST_F(StaticInstancesTest, They_come_with_the_wanted_properties) {
    std::vector<cim::Instance> found;
    dispatcher->enumerateInstances({}, cim::ObjectPath(nameSpace, "Gadget"),
                                   std::vector<std::string>{"color"},
                                   [&](const cim::Instance& one) { found.push_back(one); });
    ASSERT_EQ(found.size(), 1U);
    ASSERT_EQ(found[0].properties().size(), 1U);
    EXPECT_EQ(found[0].property("Color")->asString(), "blue");
}

TEST_F(StaticInstancesTest, One_is_found_by_its_path) {
    cim::ObjectPath path(nameSpace, "Thing");
    path.setKey("Id", cim::Value::unsignedInteger(cim::Type::UInt16, 1));
    EXPECT_EQ(dispatcher->getInstance({}, path, {}).property("Color")->asString(), "red");
    path.setKey("Id", cim::Value::unsignedInteger(cim::Type::UInt16, 9));
    EXPECT_THROW(dispatcher->getInstance({}, path, {}), client::CimError);
}

TEST_F(StaticInstancesTest, A_provider_of_the_class_takes_their_place) {
    dispatcher->add(
        {"Gadget", {nameSpace}, "P", "no-such-library", {broker::ProviderType::Instance}});
    EXPECT_THROW(paths("Gadget"), client::CimError); // the provider is asked
}

} // namespace
} // namespace qelo::schema::testing
