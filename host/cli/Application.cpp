#include "Application.h"

#include "Arguments.h"
#include "CommandLine.h"
#include "ExitStatus.h"
#include "render/Display.h"

#include <client/Unreachable.h>

#include <algorithm>
#include <exception>
#include <new>

namespace qelo::cli {
namespace {

constexpr char kProgram[] = "qelosim";
constexpr char kPasswordOption[] = "--password-stdin";

constexpr char kFooter[] =
    "A path is written as ein prints it: ZANTH_Group.CreationClassName=\"ZANTH_Group\","
    "Name=\"adm\".\n\n"
    "Exit status: 0 done; 1 to 63 the CIM status code of the error (1 failed, 5 no such class,\n"
    "6 not found, 7 not supported, ...); 64 the command line is wrong; 66 the store or the\n"
    "schema cannot be read; 69 the server cannot be reached; 70 internal error; 74 the output "
    "cannot be written; "
    "141 its reader has gone.";

// Exactly one line, whatever stands in the message.
void report(Output& errors, const std::string& message) {
    try {
        errors.write(std::string(kProgram) + ": " + displayText(message) + "\n");
        errors.flush();
    } catch (const std::exception&) {
        // There is nobody left to tell.
    }
}

std::string describe(const client::CimError& error) {
    const std::string code = cimStatusName(error.code()) + (", " + std::to_string(error.code()));
    const std::string text = error.what();
    return text.empty() ? code : text + " (" + code + ")";
}

void describeProgram(CLI::App& app) {
    app.name(kProgram);
    app.description("Accounts, groups and the other objects of the Simple Identity Management "
                    "provider.");
    app.footer(kFooter);
    app.set_version_flag("--version", std::string(kProgram) + " " + QELO_VERSION);
    app.require_subcommand(0, 1);
    app.formatter(std::make_shared<HelpFormat>());
}

void addCommands(CLI::App& app, Invocation& invocation, const Environment& environment) {
    addCommonOptions(app, invocation.options);
    addAccountCommands(app, invocation);
    addGroupCommands(app, invocation);
    addIdentityCommands(app, invocation);
    addInstanceCommands(app, invocation);
    addSchemaCommands(app, invocation);
    addAssociationCommands(app, invocation);
    addMethodCommands(app, invocation);
    addServiceCommands(app, invocation);
    addAdministrationCommands(app, invocation);
    for (const auto& add : environment.furtherCommands) {
        add(app, invocation);
    }
}

// The command line in the order in which CLI11 takes it: last argument first.
std::vector<std::string> reversedArguments(int count, const char* const* arguments) {
    std::vector<std::string> texts = spelledOut(count, arguments);
    std::reverse(texts.begin(), texts.end());
    return texts;
}

std::string helpOf(const CLI::App& app) {
    const auto chosen = app.get_subcommands();
    return chosen.empty() ? app.help() : chosen.front()->help(kProgram);
}

bool readsPassword(const CLI::App& command) {
    return command.get_option_no_throw(kPasswordOption) != nullptr;
}

// Whoever forgets how to give a password may have given it in any of these words: no more is told
// of them than the names of options.
std::string describeSuperfluous(const std::vector<std::string>& words) {
    std::string text = "a password is not given as an argument, and what was given is not expected";
    for (const std::string& word : words) {
        text += word[0] == '-' ? ": " + word.substr(0, word.find('=')) : "";
    }
    return text;
}

// What the parser objects to. It takes an unknown command for a superfluous argument.
std::string describe(const CLI::App& app, const CLI::ParseError& error) {
    const auto superfluous = app.remaining();
    if (app.get_subcommands().empty() && !superfluous.empty() && superfluous[0][0] != '-') {
        return "no such command: \"" + superfluous[0] + "\"";
    }
    const auto chosen = app.get_subcommands();
    if (!chosen.empty() && readsPassword(*chosen.front())) {
        const auto words = app.remaining(true);
        if (!words.empty() ||
            std::string(error.what()).find(kPasswordOption) != std::string::npos) {
            return describeSuperfluous(words);
        }
    }
    return error.what();
}

// The text that was asked for instead of a command: help or the version. Nothing: run.
std::optional<std::string> parse(CLI::App& app, int count, const char* const* arguments) {
    try {
        app.parse(reversedArguments(count, arguments));
        return std::nullopt;
    } catch (const CLI::CallForHelp&) {
        return helpOf(app);
    } catch (const CLI::CallForVersion& version) {
        return std::string(version.what()) + "\n";
    } catch (const CLI::ParseError& error) {
        const auto chosen = app.get_subcommands();
        throw UsageError(describe(app, error), chosen.empty() ? "" : chosen.front()->get_name());
    }
}

// "qelosim ei --help" for an error in the command line of `ei`.
std::string hint(const UsageError& error, const Invocation& invocation) {
    const std::string& command = error.command().empty() ? invocation.command : error.command();
    return " (see qelosim " + (command.empty() ? "" : command + " ") + "--help)";
}

void run(int count, const char* const* arguments, const Environment& environment,
         Invocation& invocation) {
    CLI::App app;
    describeProgram(app);
    addCommands(app, invocation, environment);
    if (const auto text = parse(app, count, arguments)) {
        environment.output.write(*text);
        environment.output.flush();
        return;
    }
    checkCommonOptions(invocation.options);
    CommandContext context(invocation.options, environment.connect, environment.output,
                           environment.groupIds, environment.refusalReason);
    invocation.action(context);
    environment.output.flush(); // before the providers are shut down
}

// What arrived before an error is shown before the error.
void flush(Output& output) {
    try {
        output.flush();
    } catch (const std::exception&) {
        // The first error counts.
    }
}

int reportOutputError(const OutputError& error, Output& errors) {
    if (error.readerHasGone()) {
        return ExitClosedPipe;
    }
    report(errors, std::string("cannot write the output: ") + error.what());
    return ExitOutput;
}

} // namespace

int runApplication(int count, const char* const* arguments, const Environment& environment) {
    Invocation invocation;
    invocation.action = listAccounts;
    Output& errors = environment.errors;
    const auto fail = [&](const std::string& message, int status) {
        flush(environment.output);
        report(errors, message);
        return status;
    };
    const auto failCommand = [&](const std::string& message, int status) {
        const std::string& command = invocation.command;
        return fail((command.empty() ? "accounts" : command) + ": " + message, status);
    };
    try {
        run(count, arguments, environment, invocation);
        return ExitSuccess;
    } catch (const OutputError& error) {
        return reportOutputError(error, errors);
    } catch (const UsageError& error) {
        return fail(error.what() + hint(error, invocation), ExitUsage);
    } catch (const StoreError& error) {
        return fail(error.what(), ExitNoInput);
    } catch (const client::Unreachable& error) {
        return fail(error.what(), ExitUnavailable);
    } catch (const client::CimError& error) {
        return failCommand(describe(error), exitStatusOf(error.code()));
    } catch (const std::bad_alloc&) {
        return fail("out of memory", ExitSoftware);
    } catch (const std::exception& error) {
        return failCommand(error.what(), ExitSoftware);
    } catch (...) {
        return failCommand("unknown error", ExitSoftware);
    }
}

} // namespace qelo::cli
