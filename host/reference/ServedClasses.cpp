#include "ServedClasses.h"

#include <broker/Dispatcher.h>
#include <broker/RegistrationFile.h>
#include <schema/Mof.h>

#include <cstdlib>
#include <fstream>
#include <stdexcept>

namespace qelo::reference {
namespace {

namespace fs = std::filesystem;

constexpr char kNameSpace[] = "root/cimv2";

constexpr char kNodes[] = R"({"nodes": [
    {"type": 17, "path": "/UserAdministration/1"},
    {"type": 40, "path": "/AccountServiceRoot/1"},
    {"type": 46, "path": "/UserAdministration/1/UserAccount/alice",
     "properties": {"108": "alice", "89": "1000", "123": 1}},
    {"type": 51, "path": "/UserAdministration/1/UserGroup/crew", "properties": {"108": "crew"}}]})";

void chooseStore(const fs::path& scratch) {
    const fs::path file = scratch / "nodes.json";
    std::ofstream(file) << kNodes;
    ::setenv("QELO_NODE_STORE", ("file:" + file.string()).c_str(), 1);
}

std::vector<broker::ProviderRegistration> registrationsOf(const fs::path& folder) {
    std::vector<broker::ProviderRegistration> all;
    for (const fs::path& file : schema::schemaFiles(folder, ".reg")) {
        const auto read = broker::parseRegistrations(file.string(), schema::readSchemaFile(file));
        all.insert(all.end(), read.registrations.begin(), read.registrations.end());
    }
    return all;
}

std::vector<std::string> propertiesOf(broker::Dispatcher& dispatcher,
                                      const broker::ProviderRegistration& registration) {
    std::vector<std::string> names;
    const cim::ObjectPath path(registration.nameSpaces.front(), registration.className);
    dispatcher.enumerateInstances({}, path, {}, [&](const cim::Instance& instance) {
        names.clear();
        for (const cim::ObjectPath::Key& key : instance.path().keys()) {
            names.push_back(key.name);
        }
        for (const cim::Instance::Property& property : instance.properties()) {
            names.push_back(property.name);
        }
    });
    if (names.empty()) {
        throw std::runtime_error("there is no instance of " + registration.className);
    }
    return names;
}

} // namespace

schema::ClassRepository readSchema(const fs::path& folder) {
    schema::ClassRepository repository;
    schema::loadMofFolder(folder, kNameSpace, repository);
    return repository;
}

std::vector<ServedClass> askProviders(const fs::path& schemaFolder, const fs::path& libraries,
                                      const fs::path& scratch) {
    chooseStore(scratch);
    broker::DispatcherOptions options;
    options.libraryDirectories = {libraries.string()};
    broker::Dispatcher dispatcher(std::move(options));
    std::vector<ServedClass> classes;
    const auto registrations = registrationsOf(schemaFolder);
    dispatcher.add(registrations);
    classes.reserve(registrations.size());
    for (const broker::ProviderRegistration& registration : registrations) {
        classes.push_back({registration, propertiesOf(dispatcher, registration)});
    }
    return classes;
}

} // namespace qelo::reference
