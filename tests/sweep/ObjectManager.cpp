#include "MixedOperations.h"

#include <broker/RegistrationFile.h>
#include <broker/Schema.h>
#include <schema/Mof.h>

#include <filesystem>

namespace qelo::test {

namespace {

constexpr const char* kNameSpace = "root/cimv2";

} // namespace

ObjectManager::ObjectManager() {
    schema::ClassRepository classes;
    schema::loadMofFolder(QELO_SCHEMA_DIRECTORY, kNameSpace, classes);
    broker::DispatcherOptions options;
    options.hooks.schema =
        broker::schemaHooks(std::make_shared<const schema::ClassRepository>(std::move(classes)));
    options.hooks.log.log = [this](int, const std::string&, const std::string& text) {
        const std::lock_guard<std::mutex> lock(mutex_);
        complaints_.push_back(text);
    };
    options.libraryDirectories = {QELO_LIBRARY_DIRECTORY};
    dispatcher_ = std::make_unique<broker::Dispatcher>(std::move(options));
    for (const auto& file : schema::schemaFiles(QELO_SCHEMA_DIRECTORY, ".reg")) {
        dispatcher_->add(
            broker::parseRegistrations(file.string(), schema::readSchemaFile(file)).registrations);
    }
}

ObjectManager::~ObjectManager() = default;

std::vector<std::string> ObjectManager::complaints() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return complaints_;
}

} // namespace qelo::test
