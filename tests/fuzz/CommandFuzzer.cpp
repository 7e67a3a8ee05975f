// Texts of administration commands, which may come from a client's arguments: read or refused
// with a reason that does not repeat them, and what was read is all of the text. A value that
// passes the providers' gate stays one value.
#include "FuzzInput.h"

#include <CommandRequest.h>
#include <CommandText.h>
#include <FieldRules.h>
#include <platform/ProviderUtilities.h>

#include <algorithm>
#include <cctype>
#include <cstring>

namespace {

using namespace qelo::store;
using qelo::fuzz::require;

std::string_view typeText(ArgumentType type) {
    switch (type) {
    case ArgumentType::Text:
        return "CMPI_string";
    case ArgumentType::Number:
        return "CMPI_uint32";
    case ArgumentType::DateTime:
        return "CMPI_dateTime";
    }
    std::abort();
}

std::string textOf(const CommandText& command) {
    std::string text(command.method);
    for (const CommandArgument& argument : command.arguments) {
        text.append(",").append(argument.name).append(":").append(typeText(argument.type));
        text.append(":").append(argument.value);
    }
    return text;
}

// Reasons are composed of words of ours; the client's text would bring other characters.
void checkReason(const std::string& reason) {
    require(!reason.empty() && reason.size() < 200);
    require(std::all_of(reason.begin(), reason.end(), [](unsigned char c) {
        return std::isalnum(c) != 0 || std::strchr(" .,:'\"-", c) != nullptr;
    }));
}

void checkText(const std::optional<std::string>& text) {
    require(!text || (text->size() <= 255 && text->find_first_of(":,\n") == std::string::npos &&
                      text->find('\0') == std::string::npos));
}

void checkPath(const std::optional<std::string>& path) {
    checkText(path);
    require(!path || (path->front() == '/' && !qelo::fuzz::contains(*path + "/", "/../") &&
                      !qelo::fuzz::contains(*path + "/", "//")));
}

void checkNumber(const std::optional<std::uint32_t>& number) {
    require(!number || *number <= 2147483647U);
}

// What may be handed to the tools of the system.
void checkRequest(const CommandRequest& request) {
    require(!request.name.empty() && *nameOf(request.method) != '\0');
    checkText(request.name);
    checkText(request.fullName);
    checkText(request.member);
    checkPath(request.home);
    checkPath(request.shell);
    for (const auto& number :
         {request.uid, request.gid, request.ageing.minimum, request.ageing.maximum,
          request.ageing.warning, request.ageing.inactive}) {
        checkNumber(number);
    }
    require(!request.ageing.expiry ||
            (*request.ageing.expiry >= 0 && *request.ageing.expiry < 2932898)); // year 10000
    require(!request.password ||
            (!request.password->empty() && request.password->view().size() <= 255 &&
             request.password->view().find('\n') == std::string::npos));
    const bool creates =
        request.method == Method::CreateUser || request.method == Method::CreateGroup;
    require(!creates || !checkNewName(request.name));
}

void checkCommand(std::string_view text) {
    const Attempt<CommandText> command = parseCommandText(text);
    if (!command) {
        checkReason(command.reason());
        return;
    }
    require(textOf(*command) == text);
    const Attempt<CommandRequest> request = parseCommandRequest(*command);
    if (!request) {
        checkReason(request.reason());
        return;
    }
    require(nameOf(request->method) == command->method);
    checkRequest(*request);
}

// A value cannot bring arguments of its own.
void checkGate(std::string_view value) {
    if (!Tesk::ProviderUtilities::ValidateInput(std::string(value), "")) {
        return;
    }
    const std::string text =
        "CreateUser,Name:CMPI_string:a,FullName:CMPI_string:" + std::string(value);
    const Attempt<CommandText> command = parseCommandText(text);
    require(command && command->arguments.size() == 2 && command->arguments[1].value == value);
    const Attempt<CommandRequest> request = parseCommandRequest(*command);
    require(!request || request->fullName == std::string(value));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    checkCommand(text);
    checkGate(text);
    checkGate(text.substr(std::min(text.size(), text.rfind(':') + 1)));
    return 0;
}
