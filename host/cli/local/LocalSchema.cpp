#include "LocalSchema.h"

#include "../CommandContext.h"

#include <broker/ProviderRegistry.h>
#include <schema/Mof.h>

#include <algorithm>
#include <filesystem>
#include <stdexcept>
#include <system_error>

namespace qelo::cli {
namespace {

// Every object manager has it.
constexpr char kNameSpace[] = "root/cimv2";

using Registrations = std::vector<LocalSchema::Registrations>;

Registrations readRegistrations(const std::vector<std::string>& folders) {
    Registrations result;
    for (const std::string& folder : folders) {
        for (const auto& file : schema::schemaFiles(folder, ".reg")) {
            result.push_back({file.string(), broker::parseRegistrations(
                                                 file.string(), schema::readSchemaFile(file))});
        }
    }
    return result;
}

// The namespaces that providers serve: classes are known in each of them.
std::vector<std::string> nameSpacesOf(const Registrations& registrations) {
    std::vector<std::string> names = {kNameSpace};
    for (const auto& source : registrations) {
        for (const auto& registration : source.file.registrations) {
            for (const std::string& name : registration.nameSpaces) {
                const bool known = std::any_of(names.begin(), names.end(), [&](const auto& other) {
                    return broker::sameNameSpace(name, other);
                });
                if (!known) {
                    names.push_back(name);
                }
            }
        }
    }
    return names;
}

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
    const std::vector<std::string> folders = schemaDirectories(options);
    try {
        result.registrations = readRegistrations(folders);
        for (const std::string& nameSpace : nameSpacesOf(result.registrations)) {
            for (const std::string& folder : folders) {
                schema::loadMofFolder(folder, nameSpace, classes);
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
