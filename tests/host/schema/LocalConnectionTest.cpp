// The operations on classes, over a connection inside the process.
#include "SchemaFixture.h"

#include <broker/LocalConnection.h>
#include <broker/Schema.h>

namespace qelo::schema::testing {
namespace {

using ::testing::ElementsAre;

class LocalConnectionTest : public SchemaTest {
protected:
    void SetUp() override {
        read(std::string(standardQualifiers) +
             "class A { [Key] string Name; }; class B : A {}; class C : B {};");
        connect(std::make_shared<const ClassRepository>(std::move(repository)));
    }
    void connect(std::shared_ptr<const ClassRepository> known) {
        broker::DispatcherOptions options;
        if (known) {
            options.hooks.schema = broker::schemaHooks(known);
        }
        connection = std::make_unique<broker::LocalConnection>(
            std::make_shared<broker::Dispatcher>(std::move(options)), broker::OperationContext(),
            std::move(known));
    }
    static cim::ObjectPath path(const char* className, const char* where = nameSpace) {
        return cim::ObjectPath(where, className);
    }
    std::vector<std::string> classNames(const cim::ObjectPath& start, bool deep) const {
        std::vector<std::string> found;
        connection->enumerateClassNames(start, deep,
                                        [&](const std::string& name) { found.push_back(name); });
        return found;
    }
    template <class Operation> static unsigned int codeOf(Operation operation) {
        try {
            operation();
        } catch (const client::CimError& error) {
            return error.code();
        }
        return 0;
    }

    std::unique_ptr<broker::LocalConnection> connection;
};

TEST_F(LocalConnectionTest, Classes_and_their_names_are_answered) {
    EXPECT_EQ(connection->getClass(path("c")).superclass, "B");
    EXPECT_NE(connection->getClass(path("C")).property("Name"), nullptr);
    EXPECT_THAT(classNames(path(""), false), ElementsAre("A"));
    EXPECT_THAT(classNames(path("A"), true), ElementsAre("B", "C"));
}

TEST_F(LocalConnectionTest, Unknown_classes_and_namespaces_have_codes_of_their_own) {
    EXPECT_EQ(codeOf([&] { connection->getClass(path("None")); }), 6U);
    EXPECT_EQ(codeOf([&] { classNames(path("None"), false); }), 5U);
    EXPECT_EQ(codeOf([&] { connection->getClass(path("A", "root/none")); }), 3U);
    EXPECT_EQ(codeOf([&] { classNames(path("", "root/none"), false); }), 3U);
}

TEST_F(LocalConnectionTest, Without_a_repository_classes_are_not_supported) {
    connect(nullptr);
    EXPECT_EQ(codeOf([&] { connection->getClass(path("A")); }), 7U);
    EXPECT_EQ(codeOf([&] { classNames(path(""), true); }), 7U);
}

TEST_F(LocalConnectionTest, A_class_without_provider_is_empty) {
    int found = 0;
    connection->enumerateInstances(path("A"), {}, [&](const cim::Instance&) { ++found; });
    connection->enumerateInstanceNames(path("A"), [&](const cim::ObjectPath&) { ++found; });
    EXPECT_EQ(found, 0);
    cim::ObjectPath instance = path("A");
    instance.setKey("Name", cim::Value::string("x"));
    EXPECT_EQ(codeOf([&] { connection->getInstance(instance, {}); }), 6U);
    EXPECT_EQ(codeOf([&] {
                  connection->enumerateInstances(path("None"), {}, [](const cim::Instance&) {});
              }),
              5U);
}

TEST_F(LocalConnectionTest, A_key_that_the_class_does_not_have_is_an_invalid_parameter) {
    cim::ObjectPath instance = path("A");
    instance.setKey("Title", cim::Value::string("x"));
    EXPECT_EQ(codeOf([&] { connection->getInstance(instance, {}); }), 4U);
}

} // namespace
} // namespace qelo::schema::testing
