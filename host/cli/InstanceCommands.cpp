// The operations on one class or instance, under the names that users of wbemcli know.
#include "Arguments.h"
#include "CommandLine.h"
#include "render/Writer.h"

#include <memory>

namespace qelo::cli {
namespace {

struct Target {
    std::string text; // a class or a path
    CLI::Option* propertiesOption = nullptr;
    std::vector<std::string> propertyNames;

    client::PropertyList properties() const {
        return propertyListOf(propertiesOption->count() > 0, propertyNames);
    }
};

void enumerateInstanceNames(CommandContext& context, const Target& target) {
    const cim::ObjectPath path = classPathOf(target.text, context.options());
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().enumerateInstanceNames(
        path, [&](const cim::ObjectPath& found) { writer->path(found); });
    writer->finish();
}

void enumerateInstances(CommandContext& context, const Target& target) {
    const cim::ObjectPath path = classPathOf(target.text, context.options());
    const client::PropertyList properties = target.properties();
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().enumerateInstances(
        path, properties, [&](const cim::Instance& found) { writer->instance(found); });
    writer->finish();
}

void getInstance(CommandContext& context, const Target& target) {
    const cim::ObjectPath path = instancePathOf(target.text, context.options());
    const client::PropertyList properties = target.properties();
    const auto writer = makeWriter(context.options().format, context.output());
    writer->instance(context.connection().getInstance(path, properties));
    writer->finish();
}

using Operation = void (*)(CommandContext&, const Target&);

CLI::App* addOperation(CLI::App& app, Invocation& invocation, const char* name,
                       const char* description, const char* targetName, Operation operation,
                       const std::shared_ptr<Target>& target) {
    CLI::App* command =
        addCommand(app, invocation, name, description,
                   [target, operation](CommandContext& context) { operation(context, *target); });
    command->add_option(targetName, target->text, "What to ask for")->required()->type_name("");
    return command;
}

void addPropertiesOption(CLI::App& command, Target& target) {
    target.propertiesOption =
        command.add_option("-p,--properties", target.propertyNames,
                           "Ask for these properties only (A,B,...); '' for the path alone");
    target.propertiesOption->delimiter(',')->expected(1)->take_all()->type_name("NAMES");
}

} // namespace

void addInstanceCommands(CLI::App& app, Invocation& invocation) {
    addOperation(app, invocation, "ein", "Print the paths of all instances of a class", "CLASS",
                 enumerateInstanceNames, std::make_shared<Target>());
    const auto listed = std::make_shared<Target>();
    addPropertiesOption(*addOperation(app, invocation, "ei", "Print all instances of a class",
                                      "CLASS", enumerateInstances, listed),
                        *listed);
    const auto single = std::make_shared<Target>();
    addPropertiesOption(*addOperation(app, invocation, "gi",
                                      "Print the instance with the given path", "PATH", getInstance,
                                      single),
                        *single);
}

} // namespace qelo::cli
