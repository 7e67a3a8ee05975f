// The groups and who is in them.
#include "CommandLine.h"
#include "KnownClasses.h"
#include "Listing.h"

#include <algorithm>

namespace qelo::cli {
namespace {

// The provider joins the members with commas; people read them better with a blank behind.
std::string spaced(const std::string& members) {
    std::string text;
    for (const char c : members) {
        text += c;
        if (c == ',') {
            text += ' ';
        }
    }
    return text;
}

std::size_t numberOf(const std::string& members) {
    const auto commas = std::count(members.begin(), members.end(), ',');
    return members.empty() || members == "-" ? 0 : static_cast<std::size_t>(commas) + 1;
}

// The ids stand in the table where this process can tell them.
std::vector<Column> columns(bool withIds) {
    std::vector<Column> titles = {{"NAME", Align::Left, false}};
    if (withIds) {
        titles.push_back({"GID", Align::Right, false});
    }
    titles.push_back({"SIZE", Align::Right, false});
    titles.push_back({"MEMBERS", Align::Left, true});
    return titles;
}

void writeGroupTable(CommandContext& context) {
    client::Connection& connection = context.connection(); // which also chooses the store
    const std::map<std::string, std::string> ids = context.groupIds();
    Table table(columns(!ids.empty()));
    const client::PropertyList properties = std::vector<std::string>{"Name", "GroupMembers"};
    connection.enumerateInstances(classPathOf(kGroupClass, context.options()), properties,
                                  [&](const cim::Instance& group) {
                                      const std::string name = cellText(group, "Name");
                                      const std::string members = cellText(group, "GroupMembers");
                                      std::vector<Cell> row = {Cell(name)};
                                      if (!ids.empty()) {
                                          const auto id = ids.find(name);
                                          row.emplace_back(id == ids.end() ? "-" : id->second);
                                      }
                                      row.emplace_back(std::to_string(numberOf(members)));
                                      row.emplace_back(spaced(members));
                                      table.addRow(std::move(row));
                                  });
    writeTable(context, table, counted(table.rows(), "group", "groups"));
}

void listGroups(CommandContext& context) {
    if (context.options().format == Format::Text) {
        writeGroupTable(context);
    } else {
        writeInstances(context, kGroupClass);
    }
}

} // namespace

void addGroupCommands(CLI::App& app, Invocation& invocation) {
    addCommand(app, invocation, "groups", "List the groups and their members", listGroups);
}

} // namespace qelo::cli
