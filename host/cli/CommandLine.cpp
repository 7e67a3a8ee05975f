#include "CommandLine.h"

#include <cim/ObjectPath.h>

#include <utility>

namespace qelo::cli {
namespace {

constexpr char kCommonGroup[] = "Options of all commands";

std::string storeProblem(const std::string& text) {
    for (const std::string kind : {"accounts:", "file:"}) {
        if (text.compare(0, kind.size(), kind) == 0 && text.size() > kind.size()) {
            return {};
        }
    }
    return "accounts:DIR or file:PATH is expected";
}

std::string nameSpaceProblem(const std::string& text) {
    std::string error;
    const bool valid = cim::ObjectPath::parse(text + ":X", error).has_value();
    return valid && text.compare(0, 2, "//") != 0 ? "" : "not the name of a namespace";
}

std::string formatProblem(const std::string& text) {
    return text == "text" || text == "json" || text == "mof" ? "" : "text, json or mof is expected";
}

std::string directoryProblem(const std::string& text) {
    return text.empty() ? "the name of a directory is expected" : "";
}

Format formatOf(const std::string& text) {
    if (text == "json") {
        return Format::Json;
    }
    return text == "mof" ? Format::Mof : Format::Text;
}

std::string fileProblem(const std::string& text) {
    return text.empty() ? "the name of a file is expected" : "";
}

// The object manager may be a server; then nothing of this machine matters.
std::vector<CLI::Option*> addServerOptions(CLI::App& app, Options& options) {
    auto* url = app.add_option("--url", options.url,
                               "Ask the server at http[s]://[USER[:PASSWORD]@]HOST[:PORT]");
    url->check([](const std::string& text) {
        return text.empty() ? std::string("the address of a server is expected") : std::string();
    });
    auto* password = app.add_option("--password-file", options.passwordFile,
                                    "The password for --url is the first line of FILE");
    auto* trusted = app.add_option("--ca-cert", options.caCertificate,
                                   "Trust the certificates in FILE, not those of the system");
    for (auto* option : {password, trusted}) {
        option->check(fileProblem)->type_name("FILE");
    }
    auto* insecure = app.add_flag("--insecure", options.insecure, "Trust any certificate");
    insecure->excludes(trusted);
    return {url->type_name("URL"), password, trusted, insecure};
}

} // namespace

void checkCommonOptions(const Options& options) {
    const bool local = !options.store.empty() || !options.providerDirectories.empty() ||
                       !options.schemaDirectories.empty();
    if (!options.url.empty() && local) {
        throw UsageError("--url asks a server; --store, --root, --provider-dir and --schema-dir "
                         "are for providers in this process");
    }
    const bool remote =
        !options.passwordFile.empty() || !options.caCertificate.empty() || options.insecure;
    if (options.url.empty() && remote) {
        throw UsageError("--password-file, --ca-cert and --insecure are for a server; --url names "
                         "one");
    }
}

HelpFormat::HelpFormat() { column_width(24); }

std::string HelpFormat::make_option_opts(const CLI::Option* option) const {
    return option->get_type_name().empty() ? "" : " " + option->get_type_name();
}

void addCommonOptions(CLI::App& app, Options& options) {
    auto* format = app.add_option_function<std::string>(
        "--format", [&options](const std::string& text) { options.format = formatOf(text); },
        "Output as text (the default), json or mof");
    format->check(formatProblem)->type_name("FORMAT");
    auto* json = app.add_flag_function(
        "--json", [&options](std::int64_t) { options.format = Format::Json; },
        "The same as --format json");
    json->excludes(format);
    auto* store = app.add_option("--store", options.store,
                                 "Read accounts:DIR (the root directory of a system) or file:PATH"
                                 " (a node file); else $QELO_NODE_STORE or accounts:/");
    store->check(storeProblem)->type_name("STORE");
    auto* root = app.add_option_function<std::string>(
        "--root", [&options](const std::string& text) { options.store = "accounts:" + text; },
        "The same as --store accounts:DIR");
    root->check(directoryProblem)->excludes(store)->type_name("DIR");
    auto* nameSpace =
        app.add_option("--namespace", options.nameSpace, "The CIM namespace (root/cimv2)");
    nameSpace->check(nameSpaceProblem)->type_name("NAME");
    auto* directories = app.add_option("--provider-dir", options.providerDirectories,
                                       "Look for provider libraries in DIR only; may be repeated");
    directories->check(directoryProblem)->expected(1)->take_all()->type_name("DIR");
    auto* schema =
        app.add_option("--schema-dir", options.schemaDirectories,
                       "Read classes (*.mof) and registrations (*.reg) from DIR only; may be "
                       "repeated");
    schema->check(directoryProblem)->expected(1)->take_all()->type_name("DIR");
    for (auto* option : {format, json, store, root, nameSpace, directories, schema}) {
        option->group(kCommonGroup);
    }
    for (auto* option : addServerOptions(app, options)) {
        option->group(kCommonGroup);
    }
}

CLI::App* addCommand(CLI::App& app, Invocation& invocation, const std::string& name,
                     const std::string& description, std::function<void(CommandContext&)> action) {
    CLI::App* command = app.add_subcommand(name, description);
    addCommonOptions(*command, invocation.options);
    command->callback([&invocation, name, action = std::move(action)] {
        invocation.command = name;
        invocation.action = action;
    });
    return command;
}

} // namespace qelo::cli
