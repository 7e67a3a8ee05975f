#include "LocalProviders.h"

#include "../CommandContext.h"
#include "../KnownClasses.h"
#include "KnownSchema.h"

#include <broker/Dispatcher.h>
#include <broker/LocalConnection.h>

#include <nlohmann/json.hpp>

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <fstream>
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

// The store itself can only log what it finds; a file that holds no nodes would look like a
// system without accounts.
std::string nodeFileProblem(const std::string& file) {
    const std::string problem = accessProblem(file);
    std::error_code error;
    if (!problem.empty() || !std::filesystem::is_regular_file(file, error)) {
        return problem.empty() ? file + " is not a file" : problem;
    }
    std::ifstream stream(file);
    return nlohmann::json::accept(stream) ? "" : file + " is not valid JSON";
}

// Whether the store that counts now is the machine's own account database.
bool changesThisMachine() {
    const std::string root = behind(valueOfStoreVariable(), "accounts:");
    std::error_code error;
    return !root.empty() && std::filesystem::equivalent(root, "/", error);
}

broker::ProviderRegistration registrationOf(const KnownClass& known) {
    broker::ProviderRegistration registration;
    registration.className = known.className;
    registration.nameSpaces = {"root/cimv2"};
    registration.provider = known.provider;
    registration.library = known.library;
    registration.types.add(broker::ProviderType::Instance);
    if (known.association) {
        registration.types.add(broker::ProviderType::Association);
    }
    if (known.methods) {
        registration.types.add(broker::ProviderType::Method);
    }
    return registration;
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

std::vector<std::string> providerDirectories(const Options& options) {
    if (!options.providerDirectories.empty()) {
        return options.providerDirectories;
    }
    std::vector<std::string> directories;
    std::error_code error;
    const auto executable = std::filesystem::read_symlink("/proc/self/exe", error);
    if (!error) {
        directories.push_back((executable.parent_path().parent_path() / "lib").string());
    }
    directories.emplace_back(QELO_INSTALL_LIBDIR);
    return directories;
}

std::unique_ptr<client::Connection> connectToLocalProviders(const Options& options) {
    const std::string problem = storeProblem(chooseStore(options));
    if (!problem.empty()) {
        throw StoreError(problem);
    }
    if (options.changes && changesThisMachine() && geteuid() != 0) {
        throw StoreError("only root may change the accounts of this machine; --root DIR names "
                         "another root directory");
    }
    broker::DispatcherOptions dispatcherOptions;
    dispatcherOptions.hooks.schema = knownSchema();
    dispatcherOptions.libraryDirectories = providerDirectories(options);
    auto dispatcher = std::make_shared<broker::Dispatcher>(std::move(dispatcherOptions));
    for (const KnownClass& known : knownClasses()) {
        dispatcher->add(registrationOf(known));
    }
    return std::make_unique<broker::LocalConnection>(std::move(dispatcher));
}

} // namespace qelo::cli
