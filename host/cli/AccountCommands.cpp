// The accounts as a table that administrators know how to read.
#include "CommandLine.h"
#include "KnownClasses.h"
#include "Listing.h"

#include <map>

namespace qelo::cli {
namespace {

// The values of EnabledState that accounts take, as words.
const char* stateName(const std::string& enabledState) {
    if (enabledState == "2") {
        return "enabled";
    }
    if (enabledState == "3") {
        return "disabled";
    }
    return enabledState == "6" ? "expired" : "unknown";
}

Emphasis stateEmphasis(const std::string& enabledState) {
    if (enabledState == "2") {
        return Emphasis::None;
    }
    return enabledState == "3" ? Emphasis::Faint : Emphasis::Alert;
}

// "3 accounts (1 disabled, 2 enabled)".
std::string summary(const std::map<std::string, std::size_t>& states) {
    std::size_t total = 0;
    std::string parts;
    for (const auto& [name, count] : states) {
        total += count;
        parts += (parts.empty() ? "" : ", ") + std::to_string(count) + " " + name;
    }
    const std::string text = counted(total, "account", "accounts");
    return parts.empty() ? text : text + " (" + parts + ")";
}

void writeAccountTable(CommandContext& context) {
    Table table({{"NAME", Align::Left, false},
                 {"UID", Align::Right, false},
                 {"GID", Align::Right, false},
                 {"STATE", Align::Left, false},
                 {"FULL NAME", Align::Left, true},
                 {"HOME", Align::Left, true},
                 {"SHELL", Align::Left, true}});
    // The full name comes in Description; the property FullName is always empty.
    const client::PropertyList properties = std::vector<std::string>{
        "Name", "UserID", "GroupId", "EnabledState", "Description", "HomeDirectory", "ScriptPath"};
    std::map<std::string, std::size_t> states;
    context.connection().enumerateInstances(
        classPathOf(kAccountClass, context.options()), properties,
        [&](const cim::Instance& account) {
            const std::string state = cellText(account, "EnabledState");
            ++states[stateName(state)];
            table.addRow({cellText(account, "Name"),
                          cellText(account, "UserID"),
                          cellText(account, "GroupId"),
                          {stateName(state), stateEmphasis(state)},
                          cellText(account, "Description"),
                          cellText(account, "HomeDirectory"),
                          cellText(account, "ScriptPath")});
        });
    writeTable(context, table, summary(states));
}

} // namespace

void listAccounts(CommandContext& context) {
    if (context.options().format == Format::Text) {
        writeAccountTable(context);
    } else {
        writeInstances(context, kAccountClass);
    }
}

void addAccountCommands(CLI::App& app, Invocation& invocation) {
    addCommand(app, invocation, "accounts", "List the user accounts (the default command)",
               listAccounts);
}

} // namespace qelo::cli
