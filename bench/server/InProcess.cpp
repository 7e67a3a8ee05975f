#include "InProcess.h"

#include <broker/RegistrationFile.h>
#include <broker/Schema.h>
#include <schema/Mof.h>

#include <memory>

namespace qelo::bench {
namespace {

constexpr const char* nameSpace = "root/cimv2";

} // namespace

broker::LocalConnection connectInProcess(const std::filesystem::path& trivialClasses) {
    auto classes = std::make_shared<schema::ClassRepository>();
    for (const auto& folder : {std::filesystem::path(QELO_SCHEMA_DIRECTORY), trivialClasses}) {
        schema::loadMofFolder(folder, nameSpace, *classes);
    }
    broker::DispatcherOptions options;
    options.libraryDirectories = {QELO_PROVIDER_DIRECTORY};
    options.hooks.schema = broker::schemaHooks(classes);
    auto dispatcher = std::make_shared<broker::Dispatcher>(std::move(options));
    for (const auto& folder : {std::filesystem::path(QELO_SCHEMA_DIRECTORY), trivialClasses}) {
        for (const auto& file : schema::schemaFiles(folder, ".reg")) {
            dispatcher->add(broker::parseRegistrations(file.string(), schema::readSchemaFile(file))
                                .registrations);
        }
    }
    return broker::LocalConnection(dispatcher, {}, classes);
}

} // namespace qelo::bench
