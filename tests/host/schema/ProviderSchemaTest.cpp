// The schema and the providers held against each other: everything that a provider sets must
// be declared, with exactly that type.
#include "SchemaFixture.h"

#include <broker/LocalConnection.h>
#include <broker/RegistrationFile.h>
#include <broker/Schema.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>

namespace qelo::schema {
namespace {

namespace fs = std::filesystem;
using ::testing::UnorderedElementsAreArray;

constexpr char kNameSpace[] = "root/cimv2";

constexpr char kNodes[] = R"({"nodes": [
    {"type": 17, "path": "/UserAdministration/1", "properties": {}},
    {"type": 40, "path": "/AccountServiceRoot/1", "properties": {}},
    {"type": 46, "path": "/UserAdministration/1/UserAccount/alice",
     "properties": {"108": "alice", "89": "4711", "123": 1}},
    {"type": 51, "path": "/UserAdministration/1/UserGroup/crew",
     "properties": {"108": "crew"}}]})";

class ProviderSchemaTest : public ::testing::TestWithParam<const char*> {
protected:
    static void SetUpTestSuite() {
        std::string name = (fs::temp_directory_path() / "qelo_nodes_XXXXXX").string();
        ASSERT_NE(mkdtemp(name.data()), nullptr);
        folder = name;
        std::ofstream(folder / "nodes.json") << kNodes;
        setenv("QELO_NODE_STORE", ("file:" + (folder / "nodes.json").string()).c_str(), 1);
        ClassRepository filled;
        loadMofFolder(QELO_SCHEMA_DIRECTORY, kNameSpace, filled);
        repository = std::make_shared<const ClassRepository>(std::move(filled));
    }
    static void TearDownTestSuite() {
        repository.reset();
        std::error_code ignored;
        fs::remove_all(folder, ignored);
    }

    // All instances of a class, from an object manager that knows the schema or does not.
    static std::vector<cim::Instance> instances(const char* className, bool withSchema) {
        broker::DispatcherOptions options;
        options.libraryDirectories = {QELO_PROVIDER_DIRECTORY};
        if (withSchema) {
            options.hooks.schema = broker::schemaHooks(repository);
        }
        broker::Dispatcher dispatcher(std::move(options));
        const fs::path file = fs::path(QELO_SCHEMA_DIRECTORY) / "qelosim.reg";
        dispatcher.add(
            broker::parseRegistrations(file.string(), readSchemaFile(file)).registrations);
        std::vector<cim::Instance> found;
        dispatcher.enumerateInstances({}, cim::ObjectPath(kNameSpace, className), {},
                                      [&](const cim::Instance& one) { found.push_back(one); });
        return found;
    }

    static const cim::Class& declared() {
        static const cim::Class none;
        const cim::Class* known = repository->find(kNameSpace, GetParam());
        return known == nullptr ? none : *known;
    }

    static fs::path folder;
    static std::shared_ptr<const ClassRepository> repository;
};

fs::path ProviderSchemaTest::folder;
std::shared_ptr<const ClassRepository> ProviderSchemaTest::repository;

TEST_P(ProviderSchemaTest, Every_property_is_declared_with_its_type) {
    const auto found = instances(GetParam(), false);
    ASSERT_FALSE(found.empty());
    for (const cim::Instance& instance : found) {
        EXPECT_FALSE(instance.properties().empty());
        for (const cim::Instance::Property& property : instance.properties()) {
            const cim::PropertyDeclaration* known = declared().property(property.name);
            ASSERT_NE(known, nullptr) << property.name;
            EXPECT_EQ(known->name, property.name);
            EXPECT_STREQ(cim::typeName(known->type), cim::typeName(property.value.type()))
                << property.name;
            EXPECT_EQ(known->array, property.value.isArray()) << property.name;
        }
    }
}

TEST_P(ProviderSchemaTest, Exactly_the_declared_keys_are_keys) {
    for (const cim::Instance& instance : instances(GetParam(), false)) {
        std::vector<std::string> keys;
        for (const cim::ObjectPath::Key& key : instance.path().keys()) {
            keys.push_back(key.name);
            const cim::PropertyDeclaration* known = declared().property(key.name);
            ASSERT_NE(known, nullptr) << key.name;
            EXPECT_EQ(known->type, key.value.type()) << key.name;
        }
        EXPECT_THAT(keys, UnorderedElementsAreArray(repository->keyNames(declared())));
    }
}

TEST_P(ProviderSchemaTest, References_point_where_the_class_says) {
    for (const cim::Instance& instance : instances(GetParam(), false)) {
        for (const cim::Instance::Property& property : instance.properties()) {
            if (property.value.type() == cim::Type::Reference) {
                EXPECT_TRUE(repository->isA(kNameSpace, property.value.asReference().className(),
                                            declared().property(property.name)->referenceClass))
                    << property.name;
            }
        }
    }
}

TEST_P(ProviderSchemaTest, Knowing_the_schema_takes_nothing_from_an_instance) {
    EXPECT_EQ(instances(GetParam(), true), instances(GetParam(), false));
}

INSTANTIATE_TEST_SUITE_P(Classes, ProviderSchemaTest,
                         ::testing::Values("ZANTH_Account", "ZANTH_Group", "ZANTH_SimIdentity",
                                           "ZANTH_AccountManagementService",
                                           "ZANTH_AccountManagementCapabilities",
                                           "ZANTH_AccountHostedService",
                                           "ZANTH_SimElementCapabilities", "ZANTH_ComputerSystem"),
                         [](const auto& one) { return std::string(one.param); });

} // namespace
} // namespace qelo::schema
