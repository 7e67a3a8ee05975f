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

} // namespace

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
    for (auto* option : {format, json, store, root, nameSpace, directories}) {
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
