#include "LocalSchema.h"

#include "../CommandContext.h"

#include <schema/Mof.h>

#include <filesystem>
#include <stdexcept>
#include <system_error>

namespace qelo::cli {
namespace {

// Classes without a namespace of their own are in this one.
constexpr char kNameSpace[] = "root/cimv2";

} // namespace

std::vector<std::string> schemaDirectories(const Options& options) {
    if (!options.schemaDirectories.empty()) {
        return options.schemaDirectories;
    }
    std::error_code error;
    const auto executable = std::filesystem::read_symlink("/proc/self/exe", error);
    if (!error) {
        const auto beside = executable.parent_path().parent_path() / "share/qelosim";
        if (std::filesystem::is_directory(beside, error)) {
            return {beside.string()};
        }
    }
    return {QELO_INSTALL_DATADIR};
}

LocalSchema readLocalSchema(const Options& options) {
    LocalSchema result;
    schema::ClassRepository classes;
    try {
        for (const std::string& folder : schemaDirectories(options)) {
            schema::loadMofFolder(folder, kNameSpace, classes);
            for (const auto& file : schema::schemaFiles(folder, ".reg")) {
                result.registrations.push_back(
                    {file.string(),
                     broker::parseRegistrations(file.string(), schema::readSchemaFile(file))});
            }
        }
    } catch (const schema::SchemaError& error) {
        throw StoreError(error.what());
    }
    result.classes = std::make_shared<const schema::ClassRepository>(std::move(classes));
    return result;
}

void registerProviders(const LocalSchema& schema, broker::Dispatcher& dispatcher) {
    for (const LocalSchema::Registrations& source : schema.registrations) {
        try {
            dispatcher.add(source.file.registrations);
        } catch (const std::invalid_argument& error) {
            throw StoreError(source.name + ": " + error.what());
        }
    }
}

} // namespace qelo::cli
