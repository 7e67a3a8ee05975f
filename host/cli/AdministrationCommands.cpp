// Changing accounts and groups in the words of administrators. Each command is one method
// call; what a method takes is stated in a table.
#include "Arguments.h"
#include "CommandLine.h"
#include "KnownClasses.h"
#include "PasswordInput.h"
#include "render/Display.h"

#include <memory>
#include <vector>

namespace qelo::cli {
namespace {

// The provider refuses some arguments by itself, without a word to anybody.
constexpr char kReasonElsewhere[] =
    "; an argument holds a comma, a control character or more than 255 bytes, or the log of the "
    "providers says why: ";

enum class Kind { Text, Number, Flag, Day, PasswordLine };

// An option, and the argument of the method that carries it.
struct Choice {
    const char* option;
    const char* argument;
    Kind kind;
    const char* description;
};

// One command: a method of a class, with the arguments that stand in line and the options.
struct Form {
    const char* command;
    const char* description;
    const char* className;
    const char* method;
    std::vector<const char*> positions; // "Name" first
    std::vector<Choice> choices;
    bool asksForPassword;
    const char* done; // behind it stand the positional arguments
};

const Choice kFullName = {"--full-name", "FullName", Kind::Text, "The person's name"};
const Choice kUid = {"--uid", "UserID", Kind::Number, "The user id"};
const Choice kGid = {"--gid", "GroupId", Kind::Number, "The id of the primary group"};
const Choice kHome = {"--home", "HomeDirectory", Kind::Text, "The home directory"};
const Choice kShell = {"--shell", "ScriptPath", Kind::Text, "The login shell"};
const Choice kCreateHome = {"--create-home", "CreateHome", Kind::Flag, "Make the home directory"};
const Choice kPasswordStdin = {"--password-stdin", "UserPassword", Kind::PasswordLine,
                               "Read the password from standard input"};

std::vector<Form> accountForms() {
    return {
        {"create-user",
         "Create an account",
         kAccountClass,
         "CreateUser",
         {"Name"},
         {kFullName, kUid, kGid, kHome, kShell, kCreateHome, kPasswordStdin},
         false,
         "created account"},
        {"modify-user",
         "Change an account; what is not given stays as it is",
         kAccountClass,
         "ModifyUser",
         {"Name"},
         {kFullName,
          kUid,
          kGid,
          kHome,
          kShell,
          kCreateHome,
          kPasswordStdin,
          {"--min-days", "daysMustKeepPassword", Kind::Number,
           "Days before the password may be changed again"},
          {"--max-days", "daysMustChangePasswordAfter", Kind::Number,
           "Days after which the password must be changed"},
          {"--warn-days", "daysWarnBeforePasswordExpire", Kind::Number,
           "Days of warning before that"},
          {"--inactive-days", "daysExpireAfter", Kind::Number,
           "Days after that until the account is closed"},
          {"--expires", "PasswordExpiration", Kind::Day,
           "YYYY-MM-DD, the day from which the account cannot be used"}},
         false,
         "changed account"},
        {"delete-user",
         "Delete an account",
         kAccountClass,
         "DeleteUser",
         {"Name"},
         {{"--remove-home", "RemoveHome", Kind::Flag, "Remove its home directory too"}},
         false,
         "deleted account"},
        {"set-password",
         "Set the password of an account",
         kAccountClass,
         "SetPassword",
         {"Name"},
         {kPasswordStdin},
         true,
         "set the password of account"},
        {"enable-user",
         "Unlock an account",
         kAccountClass,
         "EnableUser",
         {"Name"},
         {},
         false,
         "enabled account"},
        {"disable-user",
         "Lock an account",
         kAccountClass,
         "DisableUser",
         {"Name"},
         {},
         false,
         "disabled account"},
    };
}

std::vector<Form> groupForms() {
    return {
        {"create-group",
         "Create a group",
         kGroupClass,
         "CreateGroup",
         {"Name"},
         {{"--gid", "GroupId", Kind::Number, "The group id"}},
         false,
         "created group"},
        {"delete-group",
         "Delete a group",
         kGroupClass,
         "DeleteGroup",
         {"Name"},
         {},
         false,
         "deleted group"},
        {"add-member",
         "Add a user to a group",
         kGroupClass,
         "AddMember",
         {"Name", "Member"},
         {},
         false,
         "added member to group"},
        {"remove-member",
         "Remove a user from a group",
         kGroupClass,
         "RemoveMember",
         {"Name", "Member"},
         {},
         false,
         "removed member from group"},
    };
}

// What the command line gave for one form.
struct Request {
    Form form;
    std::vector<std::string> positions;
    client::Arguments arguments;
    bool readsPassword = false;
};

constexpr char kPasswordArgument[] = "UserPassword";

cim::Value numberValue(const std::string& option, const std::string& text) {
    try {
        std::size_t end = 0;
        const unsigned long long number = std::stoull(text, &end);
        if (end == text.size() && text[0] != '-' && number <= UINT32_MAX) {
            return cim::Value::unsignedInteger(cim::Type::UInt32, number);
        }
    } catch (const std::logic_error&) {
        // not a number at all, or far too large
    }
    throw CLI::ValidationError(option, "not a number from 0 to 4294967295: " + text);
}

cim::Value dayValue(const std::string& option, const std::string& text) {
    const bool shaped = text.size() == 10 && text[4] == '-' && text[7] == '-';
    const std::string digits =
        shaped ? text.substr(0, 4) + text.substr(5, 2) + text.substr(8, 2) : std::string();
    const auto day = cim::DateTime::parse(digits + "000000.000000+000");
    if (!day) {
        throw CLI::ValidationError(option, "not a day such as 2027-12-31: " + text);
    }
    return cim::Value::dateTime(*day);
}

void addChoice(CLI::App& command, const Choice& choice, const std::shared_ptr<Request>& request) {
    const auto take = [request, choice](cim::Value value) {
        request->arguments.emplace_back(choice.argument, std::move(value));
    };
    switch (choice.kind) {
    case Kind::Flag:
        command.add_flag_callback(
            choice.option, [take] { take(cim::Value::unsignedInteger(cim::Type::UInt32, 1)); },
            choice.description);
        return;
    case Kind::PasswordLine:
        command.add_flag_callback(
            choice.option, [request] { request->readsPassword = true; }, choice.description);
        return;
    default:
        break;
    }
    const auto value = [choice, take](const std::string& text) {
        if (choice.kind == Kind::Number) {
            take(numberValue(choice.option, text));
        } else if (choice.kind == Kind::Day) {
            take(dayValue(choice.option, text));
        } else {
            take(cim::Value::string(text));
        }
    };
    const char* type = choice.kind == Kind::Number ? "N"
                       : choice.kind == Kind::Day  ? "DAY"
                                                   : "TEXT";
    command.add_option_function<std::string>(choice.option, value, choice.description)
        ->type_name(type);
}

// The method's arguments: those in line, the options, and the password, which is read last.
client::Arguments argumentsOf(const Request& request) {
    client::Arguments arguments;
    for (std::size_t i = 0; i < request.positions.size(); ++i) {
        arguments.emplace_back(request.form.positions[i], cim::Value::string(request.positions[i]));
    }
    arguments.insert(arguments.end(), request.arguments.begin(), request.arguments.end());
    if (request.readsPassword) {
        arguments.emplace_back(kPasswordArgument, cim::Value::string(passwordFromInput().text()));
    } else if (request.form.asksForPassword) {
        arguments.emplace_back(
            kPasswordArgument,
            cim::Value::string(passwordFromTerminal(request.positions.front()).text()));
    }
    return arguments;
}

// How the store says that a failed command has left something behind, as on a full disk.
constexpr const char* kNotUndone = "; not undone: ";

// The provider answers every refusal with the same words. Why stands in the store's log line,
// which this process can overhear when the store is its own.
[[noreturn]] void fail(const CommandContext& context, const client::CimError& error) {
    const std::string reason = context.refusalReason();
    if (reason.find(kNotUndone) != std::string::npos) {
        throw client::CimError(error.code(), "failed, and not all could be put back: " + reason);
    }
    throw client::CimError(
        error.code(),
        "refused or failed, nothing was changed" +
            (reason.empty() ? std::string(kReasonElsewhere) + error.what() : ": " + reason));
}

void administer(CommandContext& context, const Request& request) {
    constexpr unsigned int failed = 1;
    client::Connection& connection = context.connectionForChanges();
    const cim::ObjectPath target(context.options().nameSpace, request.form.className);
    try {
        connection.invokeMethod(target, request.form.method, argumentsOf(request));
    } catch (const client::CimError& error) {
        if (error.code() != failed) {
            throw;
        }
        fail(context, error);
    }
    std::string names;
    for (const std::string& position : request.positions) {
        names += " " + displayText(position);
    }
    context.output().write(request.form.done + names + "\n");
}

void addForm(CLI::App& app, Invocation& invocation, const Form& form) {
    const auto request = std::make_shared<Request>();
    request->form = form;
    request->positions.resize(form.positions.size());
    CLI::App* command =
        addCommand(app, invocation, form.command, form.description,
                   [request](CommandContext& context) { administer(context, *request); });
    const char* firstName = form.className == std::string(kGroupClass) ? "GROUP" : "NAME";
    for (std::size_t i = 0; i < form.positions.size(); ++i) {
        command->add_option(i == 0 ? firstName : "USER", request->positions[i])
            ->required()
            ->type_name("");
    }
    for (const Choice& choice : form.choices) {
        addChoice(*command, choice, request);
    }
}

} // namespace

void addAdministrationCommands(CLI::App& app, Invocation& invocation) {
    std::vector<Form> forms = accountForms();
    for (Form& form : groupForms()) {
        forms.push_back(std::move(form));
    }
    for (const Form& form : forms) {
        addForm(app, invocation, form);
    }
}

} // namespace qelo::cli
