// The operations on classes, under the names that users of wbemcli know.
#include "Arguments.h"
#include "CommandLine.h"
#include "render/ClassText.h"
#include "render/Display.h"

#include <memory>

namespace qelo::cli {
namespace {

struct Question {
    std::string className;
    bool deep = false;
};

void getClass(CommandContext& context, const Question& question) {
    const cim::ObjectPath path = classPathOf(question.className, context.options());
    const cim::Class found = context.connection().getClass(path);
    context.output().write(context.options().format == Format::Json ? classJson(found)
                                                                    : classMof(found));
}

// Without a class, those of the namespace that have no superclass are asked for.
cim::ObjectPath startOf(const Question& question, const Options& options) {
    if (question.className.empty()) {
        return cim::ObjectPath(options.nameSpace, "");
    }
    return classPathOf(question.className, options);
}

void enumerateClassNames(CommandContext& context, const Question& question) {
    const Format format = context.options().format;
    if (format == Format::Mof) {
        throw UsageError("names of classes have no MOF form; use text or json");
    }
    std::vector<std::string> names;
    context.connection().enumerateClassNames(
        startOf(question, context.options()), question.deep,
        [&](const std::string& name) { names.push_back(name); });
    if (format == Format::Json) {
        context.output().write(classNamesJson(names));
        return;
    }
    for (const std::string& name : names) {
        context.output().write(displayText(name) + "\n");
    }
}

} // namespace

void addSchemaCommands(CLI::App& app, Invocation& invocation) {
    const auto single = std::make_shared<Question>();
    addCommand(app, invocation, "gc", "Print the declaration of a class",
               [single](CommandContext& context) { getClass(context, *single); })
        ->add_option("CLASS", single->className, "What to ask for")
        ->required()
        ->type_name("");
    const auto listed = std::make_shared<Question>();
    CLI::App* names =
        addCommand(app, invocation, "ecn", "Print the names of the subclasses of a class",
                   [listed](CommandContext& context) { enumerateClassNames(context, *listed); });
    names
        ->add_option("CLASS", listed->className,
                     "The class; without one, those that have no superclass are printed")
        ->type_name("");
    names->add_flag("--deep", listed->deep, "Print the subclasses of the subclasses too");
}

} // namespace qelo::cli
