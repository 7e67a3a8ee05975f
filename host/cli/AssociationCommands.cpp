// What an instance is associated with, under the names that users of wbemcli know.
#include "Arguments.h"
#include "CommandLine.h"
#include "render/Writer.h"

#include <memory>
#include <utility>

namespace qelo::cli {
namespace {

struct Source {
    std::string path;
    client::AssociationFilter filter;
    CLI::Option* propertiesOption = nullptr;
    std::vector<std::string> propertyNames;

    client::PropertyList properties() const {
        return propertyListOf(propertiesOption->count() > 0, propertyNames);
    }
};

void associatorNames(CommandContext& context, const Source& source) {
    const cim::ObjectPath path = instancePathOf(source.path, context.options());
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().associatorNames(
        path, source.filter, [&](const cim::ObjectPath& found) { writer->path(found); });
    writer->finish();
}

void associators(CommandContext& context, const Source& source) {
    const cim::ObjectPath path = instancePathOf(source.path, context.options());
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().associators(path, source.filter, source.properties(),
                                     [&](const cim::Instance& found) { writer->instance(found); });
    writer->finish();
}

void referenceNames(CommandContext& context, const Source& source) {
    const cim::ObjectPath path = instancePathOf(source.path, context.options());
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().referenceNames(path, source.filter,
                                        [&](const cim::ObjectPath& found) { writer->path(found); });
    writer->finish();
}

void references(CommandContext& context, const Source& source) {
    const cim::ObjectPath path = instancePathOf(source.path, context.options());
    const auto writer = makeWriter(context.options().format, context.output());
    context.connection().references(path, source.filter, source.properties(),
                                    [&](const cim::Instance& found) { writer->instance(found); });
    writer->finish();
}

std::string nameProblem(const std::string& text) {
    return isName(text) ? "" : "not a name: \"" + text + "\"";
}

// For the associations themselves, users of wbemcli give their class either way.
void takeAssociationClassAsResult(client::AssociationFilter& filter) {
    if (filter.assocClass.empty()) {
        return;
    }
    if (!filter.resultClass.empty() && !cim::sameName(filter.resultClass, filter.assocClass)) {
        throw UsageError("-ac and -rc both name the class of the associations, and differ");
    }
    filter.resultClass = std::exchange(filter.assocClass, {});
}

void addFilter(CLI::App& command, const char* option, std::string& value, const char* type,
               const char* description) {
    command.add_option(option, value, description)->check(nameProblem)->type_name(type);
}

using Operation = void (*)(CommandContext&, const Source&);

struct Form {
    const char* name;
    const char* description;
    Operation operation;
    bool instances; // instances or only paths
    bool farEnd;    // associated objects or only the associations
};

void addOperation(CLI::App& app, Invocation& invocation, const Form& form) {
    const auto source = std::make_shared<Source>();
    CLI::App* command = addCommand(app, invocation, form.name, form.description,
                                   [source, form](CommandContext& context) {
                                       if (!form.farEnd) {
                                           takeAssociationClassAsResult(source->filter);
                                       }
                                       form.operation(context, *source);
                                   });
    command->add_option("PATH", source->path, "The instance to start from")
        ->required()
        ->type_name("");
    auto& filter = source->filter;
    addFilter(*command, "--result-class", filter.resultClass, "CLASS",
              "(-rc) Only results of this class");
    addFilter(*command, "-r,--role", filter.role, "ROLE",
              "Only where the source has this role in the association");
    if (!form.farEnd) {
        addFilter(*command, "--assoc-class", filter.assocClass, "CLASS", "(-ac) The same");
        command
            ->add_option_function<std::string>("--result-role",
                                               [](const std::string&) {
                                                   throw CLI::ValidationError(
                                                       "rin and ri have no result role");
                                               })
            ->group("");
    } else {
        addFilter(*command, "--assoc-class", filter.assocClass, "CLASS",
                  "(-ac) Only through associations of this class");
        addFilter(*command, "--result-role", filter.resultRole, "ROLE",
                  "(-rr) Only where the result has this role in the association");
    }
    if (form.instances) {
        source->propertiesOption =
            command->add_option("-p,--properties", source->propertyNames,
                                "Ask for these properties only (A,B,...); '' for the path alone");
        source->propertiesOption->delimiter(',')->expected(1)->take_all()->type_name("NAMES");
    }
}

} // namespace

void addAssociationCommands(CLI::App& app, Invocation& invocation) {
    const Form forms[] = {
        {"ain", "Print the paths of the instances associated with one", associatorNames, false,
         true},
        {"ai", "Print the instances associated with one", associators, true, true},
        {"rin", "Print the paths of the associations that refer to an instance", referenceNames,
         false, false},
        {"ri", "Print the associations that refer to an instance", references, true, false},
    };
    for (const Form& form : forms) {
        addOperation(app, invocation, form);
    }
}

} // namespace qelo::cli
