// The two registrations that are shipped, one for each object manager, say the same.
#include "SchemaFixture.h"

#include <broker/RegistrationFile.h>

#include <set>

namespace qelo::schema {
namespace {

// What the registration needs of the classes that OpenPegasus has for it.
constexpr char kClasses[] = R"(
class PG_ProviderModule { [Key] string Name; string Location; string Vendor; string Version;
                          string InterfaceType; string InterfaceVersion; };
class PG_Provider { [Key] string ProviderModuleName; [Key] string Name; };
class PG_ProviderCapabilities { [Key] string ProviderModuleName; [Key] string ProviderName;
                                [Key] string CapabilityID; string ClassName; string Namespaces[];
                                uint16 ProviderType[]; string SupportedProperties[];
                                string SupportedMethods[]; };
)";

std::string text(const cim::Instance& instance, const char* name) {
    const cim::Value* const value = instance.property(name);
    return value == nullptr ? "(none)" : value->toText();
}

std::string typesOf(const broker::ProviderTypes& types) {
    std::string result;
    const std::pair<broker::ProviderType, const char*> numbers[] = {
        {broker::ProviderType::Instance, "2"},
        {broker::ProviderType::Association, "3"},
        {broker::ProviderType::Method, "5"}};
    for (const auto& [type, number] : numbers) {
        if (types.has(type)) {
            result += (result.empty() ? "" : ",") + std::string(number);
        }
    }
    return result;
}

class PegasusRegistration : public ::testing::Test {
protected:
    void SetUp() override {
        const IncludeResolver none = [](const std::string&, const std::string&) -> MofSource {
            throw std::runtime_error("no includes");
        };
        const std::filesystem::path folder = QELO_SCHEMA_DIRECTORY;
        readMof({"qualifiers.mof", readSchemaFile(folder / "qualifiers.mof")}, "root/x", none,
                repository_);
        readMof({"classes.mof", kClasses}, "root/x", none, repository_);
        readMof({"registration.mof", readSchemaFile(folder / "pegasus/registration.mof")}, "root/x",
                none, repository_);
        sfcb_ = broker::parseRegistrations("qelosim.reg", readSchemaFile(folder / "qelosim.reg"))
                    .registrations;
    }
    std::vector<const cim::Instance*> all(const char* className) const {
        return repository_.instances("root/x", className);
    }

    ClassRepository repository_;
    std::vector<broker::ProviderRegistration> sfcb_;
};

TEST_F(PegasusRegistration, Names_the_interface_that_the_providers_speak) {
    const auto modules = all("PG_ProviderModule");
    ASSERT_EQ(modules.size(), 2U);
    for (const cim::Instance* module : modules) {
        EXPECT_EQ(text(*module, "InterfaceType"), "CMPI");
        EXPECT_EQ(text(*module, "InterfaceVersion"), "2.0.0");
    }
}

TEST_F(PegasusRegistration, Says_of_every_class_what_the_other_registration_says) {
    std::map<std::string, std::string> libraries;
    for (const cim::Instance* module : all("PG_ProviderModule")) {
        libraries[text(*module, "Name")] = text(*module, "Location");
    }
    std::set<std::string> here;
    for (const cim::Instance* entry : all("PG_ProviderCapabilities")) {
        here.insert(text(*entry, "ClassName") + " " + text(*entry, "ProviderName") + " " +
                    libraries[text(*entry, "ProviderModuleName")] + " " +
                    text(*entry, "ProviderType") + " " + text(*entry, "Namespaces"));
    }
    std::set<std::string> there;
    for (const broker::ProviderRegistration& entry : sfcb_) {
        there.insert(entry.className + " " + entry.provider + " " + entry.library + " " +
                     typesOf(entry.types) + " " + entry.nameSpaces.at(0));
    }
    EXPECT_EQ(there.size(), 8U);
    EXPECT_EQ(here, there);
}

TEST_F(PegasusRegistration, Names_every_provider_with_its_module) {
    std::set<std::string> providers;
    for (const cim::Instance* provider : all("PG_Provider")) {
        providers.insert(text(*provider, "ProviderModuleName") + "/" + text(*provider, "Name"));
    }
    EXPECT_EQ(providers.size(), all("PG_ProviderCapabilities").size());
    for (const cim::Instance* entry : all("PG_ProviderCapabilities")) {
        EXPECT_EQ(providers.count(text(*entry, "ProviderModuleName") + "/" +
                                  text(*entry, "ProviderName")),
                  1U);
    }
}

} // namespace
} // namespace qelo::schema
