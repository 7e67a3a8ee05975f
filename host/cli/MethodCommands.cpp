// Calls of extrinsic methods.
#include "Arguments.h"
#include "CommandLine.h"
#include "render/Writer.h"

#include <memory>

namespace qelo::cli {
namespace {

struct Call {
    std::string path;
    std::string method;
    std::vector<std::string> arguments;
};

// The provider's words, and behind them the store's where this process can overhear it.
client::MethodResult invoke(CommandContext& context, const cim::ObjectPath& path,
                            const std::string& method, const client::Arguments& arguments) {
    constexpr unsigned int failed = 1;
    client::Connection& connection = context.connectionForChanges();
    try {
        return connection.invokeMethod(path, method, arguments);
    } catch (const client::CimError& error) {
        const std::string reason = error.code() == failed ? context.refusalReason() : "";
        if (reason.empty()) {
            throw;
        }
        throw client::CimError(failed, std::string(error.what()) + ": " + reason);
    }
}

void callMethod(CommandContext& context, const Call& call) {
    if (context.options().format == Format::Mof) {
        throw UsageError("the result of a method has no MOF form; use text or json");
    }
    if (!isName(call.method)) {
        throw UsageError("not a method name: \"" + call.method + "\"");
    }
    const cim::ObjectPath path = anyPathOf(call.path, context.options());
    const client::Arguments arguments = methodArgumentsOf(call.arguments);
    const client::MethodResult result = invoke(context, path, call.method, arguments);
    writeMethodResult(context.options().format, result, context.output());
}

} // namespace

void addMethodCommands(CLI::App& app, Invocation& invocation) {
    const auto call = std::make_shared<Call>();
    CLI::App* command = addCommand(app, invocation, "cm", "Call a method of an instance or class",
                                   [call](CommandContext& context) { callMethod(context, *call); });
    command->add_option("PATH", call->path, "The instance or class")->required()->type_name("");
    command->add_option("METHOD", call->method, "Its method")->required()->type_name("");
    command->add_option("ARGUMENTS", call->arguments, "Arguments: name=value or name:type=value")
        ->type_name("");
    command->footer("Types of arguments: string (the default), boolean, uint8, uint16, uint32, "
                    "uint64, sint8,\nsint16, sint32, sint64, real32, real64, char16, datetime.\n"
                    "The exit status tells whether the call was carried out; what the method "
                    "itself\nreturned is printed.");
}

} // namespace qelo::cli
