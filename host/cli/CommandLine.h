// The grammar of the command line: the options that all commands share, and the place where
// each family of commands adds its own.
#pragma once

#include "CommandContext.h"
#include "Options.h"

#include <CLI/CLI.hpp>

#include <functional>
#include <string>

namespace qelo::cli {

// What the command line asks for. Filled while it is read; `action` runs afterwards.
struct Invocation {
    Options options;
    std::string command; // as it is named in error messages
    std::function<void(CommandContext&)> action;
};

// Help without the parser's own remarks (REQUIRED, Excludes: ...).
class HelpFormat : public CLI::Formatter {
public:
    HelpFormat();
    std::string make_option_opts(const CLI::Option* option) const override;
};

// Options that every command takes.
void addCommonOptions(CLI::App& app, Options& options);

// UsageError when they contradict each other. They may stand on both sides of the command, so
// that only the whole tells.
void checkCommonOptions(const Options& options);

// A command that has the common options and runs `action` when it is chosen. Further
// arguments are added to the result. `invocation` must outlive `app`.
CLI::App* addCommand(CLI::App& app, Invocation& invocation, const std::string& name,
                     const std::string& description, std::function<void(CommandContext&)> action);

// One for each file of commands.
void addAccountCommands(CLI::App& app, Invocation& invocation);
void addGroupCommands(CLI::App& app, Invocation& invocation);
void addIdentityCommands(CLI::App& app, Invocation& invocation);
void addInstanceCommands(CLI::App& app, Invocation& invocation);
void addSchemaCommands(CLI::App& app, Invocation& invocation);
void addAssociationCommands(CLI::App& app, Invocation& invocation);
void addMethodCommands(CLI::App& app, Invocation& invocation);
void addServiceCommands(CLI::App& app, Invocation& invocation);
void addAdministrationCommands(CLI::App& app, Invocation& invocation);

// What runs when no command is named: the table of accounts.
void listAccounts(CommandContext& context);

} // namespace qelo::cli
