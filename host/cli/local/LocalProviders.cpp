#include "LocalProviders.h"

#include "../CommandContext.h"
#include "LocalSchema.h"

#include <broker/Dispatcher.h>
#include <broker/LocalConnection.h>
#include <broker/Schema.h>

#include <Instrumentation.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <stdexcept>
#include <system_error>
#include <unistd.h>

namespace qelo::cli {
namespace {

constexpr char kStoreVariable[] = "QELO_NODE_STORE";
constexpr char kDefaultStore[] = "accounts:/";

std::string valueOfStoreVariable() {
    const char* const value = std::getenv(kStoreVariable);
    return value == nullptr || *value == '\0' ? kDefaultStore : value;
}

// Sets the variable where the command line says so, and returns what counts now.
std::string chooseStore(const Options& options) {
    if (!options.store.empty() && setenv(kStoreVariable, options.store.c_str(), 1) != 0) {
        throw std::system_error(errno, std::generic_category(), kStoreVariable);
    }
    return valueOfStoreVariable();
}

// The text behind `prefix`; empty when the text does not begin with it.
std::string behind(const std::string& text, const std::string& prefix) {
    return text.compare(0, prefix.size(), prefix) == 0 ? text.substr(prefix.size()) : "";
}

std::string accessProblem(const std::string& file) {
    return access(file.c_str(), R_OK) == 0
               ? ""
               : "cannot read " + file + ": " + std::generic_category().message(errno);
}

std::string nodeFileProblem(const std::string& file) {
    const std::string problem = accessProblem(file);
    std::error_code error;
    return problem.empty() && !std::filesystem::is_regular_file(file, error)
               ? file + " is not a file"
               : problem;
}

// Why the store that counts now serves nothing, in its own words. Providers can only log them
// and would show a system without accounts. What is read here is theirs too: they share it.
std::string refusalOfStore() {
    try {
        Tesk::Instrumentation nodes;
        nodes.selectNode(Tesk::NodeLexicon::UserAdministration);
        return {};
    } catch (const std::runtime_error& error) {
        return error.what();
    }
}

} // namespace

std::string storeProblem(const std::string& store) {
    const std::string nodeFile = behind(store, "file:");
    if (!nodeFile.empty()) {
        return nodeFileProblem(nodeFile);
    }
    const std::string root = behind(store, "accounts:");
    return root.empty() ? "" : accessProblem((std::filesystem::path(root) / "etc/passwd").string());
}

bool changesThisMachine() {
    const std::string root = behind(valueOfStoreVariable(), "accounts:");
    std::error_code error;
    return !root.empty() && std::filesystem::equivalent(root, "/", error);
}

std::vector<std::string> providerDirectories(const Options& options) {
    if (!options.providerDirectories.empty()) {
        return options.providerDirectories;
    }
    std::vector<std::string> directories;
    std::error_code error;
    const auto executable = std::filesystem::read_symlink("/proc/self/exe", error);
    if (!error) {
        const auto prefix = executable.parent_path().parent_path();
        directories.push_back((prefix / "lib/cmpi").string()); // where it is installed
        directories.push_back((prefix / "lib").string());      // where it is built
    }
    directories.emplace_back(QELO_INSTALL_PROVIDER_DIR);
    return directories;
}

LocalObjectManager openLocalObjectManager(const Options& options) {
    std::string problem = storeProblem(chooseStore(options));
    if (problem.empty()) {
        problem = refusalOfStore();
    }
    if (!problem.empty()) {
        throw StoreError(problem);
    }
    if (options.changes && changesThisMachine() && geteuid() != 0) {
        throw StoreError("only root may change the accounts of this machine; --root DIR names "
                         "another root directory");
    }
    LocalSchema schema = readLocalSchema(options);
    broker::DispatcherOptions dispatcherOptions;
    dispatcherOptions.hooks.schema = broker::schemaHooks(schema.classes);
    dispatcherOptions.libraryDirectories = providerDirectories(options);
    auto dispatcher = std::make_shared<broker::Dispatcher>(std::move(dispatcherOptions));
    registerProviders(schema, *dispatcher);
    LocalObjectManager manager = {std::move(dispatcher), std::move(schema.classes), {}};
    for (const LocalSchema::Registrations& source : schema.registrations) {
        const auto& warnings = source.file.warnings;
        manager.warnings.insert(manager.warnings.end(), warnings.begin(), warnings.end());
    }
    return manager;
}

std::unique_ptr<client::Connection> connectToLocalProviders(const Options& options) {
    LocalObjectManager manager = openLocalObjectManager(options);
    return std::make_unique<broker::LocalConnection>(
        std::move(manager.router), broker::OperationContext(), std::move(manager.repository));
}

} // namespace qelo::cli
