// The identities that accounts stand for.
#include "CommandLine.h"
#include "KnownClasses.h"
#include "Listing.h"

namespace qelo::cli {
namespace {

void writeIdentityTable(CommandContext& context) {
    Table table({{"INSTANCE ID", Align::Left, false}, {"ELEMENT NAME", Align::Left, true}});
    const client::PropertyList properties = std::vector<std::string>{"InstanceID", "ElementName"};
    context.connection().enumerateInstances(
        classPathOf(kIdentityClass, context.options()), properties,
        [&](const cim::Instance& identity) {
            table.addRow({cellText(identity, "InstanceID"), cellText(identity, "ElementName")});
        });
    writeTable(context, table, counted(table.rows(), "identity", "identities"));
}

void listIdentities(CommandContext& context) {
    if (context.options().format == Format::Text) {
        writeIdentityTable(context);
    } else {
        writeInstances(context, kIdentityClass);
    }
}

} // namespace

void addIdentityCommands(CLI::App& app, Invocation& invocation) {
    addCommand(app, invocation, "identity", "List the identity of the accounts", listIdentities);
}

} // namespace qelo::cli
