// The account management service, what it can do, and the tree of all objects.
#include "CommandLine.h"
#include "KnownClasses.h"
#include "Listing.h"
#include "render/Display.h"

#include <set>

namespace qelo::cli {
namespace {

void writeServiceTable(CommandContext& context) {
    Table table({{"NAME", Align::Left, false},
                 {"SYSTEM", Align::Left, false},
                 {"ENABLED STATE", Align::Right, false},
                 {"REQUESTED STATE", Align::Right, false}});
    const client::PropertyList properties =
        std::vector<std::string>{"Name", "SystemName", "EnabledState", "RequestedState"};
    context.connection().enumerateInstances(
        classPathOf(kServiceClass, context.options()), properties,
        [&](const cim::Instance& service) {
            table.addRow({cellText(service, "Name"), cellText(service, "SystemName"),
                          cellText(service, "EnabledState"), cellText(service, "RequestedState")});
        });
    writeTable(context, table, counted(table.rows(), "service", "services"));
}

void writeCapabilitiesTable(CommandContext& context) {
    Table table({{"INSTANCE ID", Align::Left, false},
                 {"OPERATIONS", Align::Left, false},
                 {"STATES", Align::Left, false}});
    const client::PropertyList properties =
        std::vector<std::string>{"InstanceID", "OperationsSupported", "RequestedStatesSupported"};
    context.connection().enumerateInstances(
        classPathOf(kCapabilitiesClass, context.options()), properties,
        [&](const cim::Instance& capabilities) {
            table.addRow({cellText(capabilities, "InstanceID"),
                          cellText(capabilities, "OperationsSupported"),
                          cellText(capabilities, "RequestedStatesSupported")});
        });
    writeTable(context, table,
               counted(table.rows(), "capabilities object", "capabilities objects"));
}

// In text as a table, in the other formats as instances.
std::function<void(CommandContext&)> listing(const char* className,
                                             void (*writeText)(CommandContext&)) {
    return [=](CommandContext& context) {
        if (context.options().format == Format::Text) {
            writeText(context);
        } else {
            writeInstances(context, className);
        }
    };
}

// An object in a tree: its class, and the key that tells it from others of its class.
std::string labelOf(const cim::ObjectPath& path) {
    for (const char* name : {"Name", "InstanceID"}) {
        if (const cim::Value* key = path.key(name); key != nullptr) {
            return path.className() + " " + displayText(key->toText());
        }
    }
    return path.className();
}

// Walks along every association from one object to those that were not met before.
class Tree {
public:
    explicit Tree(CommandContext& context) : context_(context) {}

    void root(const cim::ObjectPath& path) {
        met_.insert(path.toText(false, false));
        context_.output().write(labelOf(path) + "\n");
        children(path, "");
    }

private:
    struct Branch {
        std::string association;
        cim::ObjectPath path;
    };

    void children(const cim::ObjectPath& path, const std::string& indent) {
        const std::vector<Branch> branches = branchesOf(path);
        for (const Branch& branch : branches) {
            const bool last = &branch == &branches.back();
            context_.output().write(indent + (last ? "└── " : "├── ") + labelOf(branch.path) +
                                    "  (" + branch.association + ")\n");
            children(branch.path, indent + (last ? "    " : "│   "));
        }
    }

    std::vector<Branch> branchesOf(const cim::ObjectPath& path) {
        std::vector<Branch> branches;
        for (const std::string& association : knownAssociations()) {
            client::AssociationFilter filter;
            filter.assocClass = association;
            context_.connection().associatorNames(path, filter, [&](const cim::ObjectPath& found) {
                if (met_.insert(found.toText(false, false)).second) {
                    branches.push_back({association, found});
                }
            });
        }
        return branches;
    }

    CommandContext& context_;
    std::set<std::string> met_;
};

void writeTree(CommandContext& context) {
    if (context.options().format != Format::Text) {
        throw UsageError("a tree has a text form only");
    }
    std::vector<cim::ObjectPath> systems;
    context.connection().enumerateInstanceNames(
        classPathOf(kComputerSystemClass, context.options()),
        [&](const cim::ObjectPath& path) { systems.push_back(path); });
    for (const cim::ObjectPath& system : systems) {
        Tree(context).root(system);
    }
}

} // namespace

void addServiceCommands(CLI::App& app, Invocation& invocation) {
    addCommand(app, invocation, "service", "List the account management service",
               listing(kServiceClass, writeServiceTable));
    addCommand(app, invocation, "capabilities", "List what the service can do",
               listing(kCapabilitiesClass, writeCapabilitiesTable));
    addCommand(app, invocation, "tree",
               "Walk from the computer system along the associations and draw what is found",
               writeTree);
}

} // namespace qelo::cli
