#include "CommandText.h"

#include <algorithm>
#include <array>
#include <utility>

namespace qelo::store {

namespace {

bool isControl(char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7f; }

bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }

bool isWordCharacter(char c) { return isLetter(c) || (c >= '0' && c <= '9') || c == '_'; }

bool isWord(std::string_view text) {
    return !text.empty() && isLetter(text.front()) &&
           std::all_of(text.begin(), text.end(), isWordCharacter);
}

// The part of `text` before the first `separator`; what follows it is left in `text`.
// `found` tells whether there was one.
std::string_view takeUntil(std::string_view& text, char separator, bool& found) {
    const std::size_t end = text.find(separator);
    found = end != std::string_view::npos;
    const std::string_view part = text.substr(0, end);
    text.remove_prefix(found ? end + 1 : text.size());
    return part;
}

Problem parseType(std::string_view name, ArgumentType& type) {
    static constexpr std::array<std::pair<std::string_view, ArgumentType>, 3> kTypes{
        {{"CMPI_string", ArgumentType::Text},
         {"CMPI_uint32", ArgumentType::Number},
         {"CMPI_dateTime", ArgumentType::DateTime}}};
    const auto known = std::find_if(kTypes.begin(), kTypes.end(),
                                    [&](const auto& entry) { return entry.first == name; });
    if (known == kTypes.end()) {
        return "an argument has a type that no command takes";
    }
    type = known->second;
    return {};
}

Attempt<CommandArgument> parseArgument(std::string_view text) {
    bool hasType = false;
    bool hasValue = false;
    CommandArgument argument{};
    argument.name = takeUntil(text, ':', hasType);
    const std::string_view type = takeUntil(text, ':', hasValue);
    if (!isWord(argument.name)) {
        return Refusal{"an argument has no proper name"};
    }
    if (!hasType || !hasValue) {
        return Refusal{"an argument has no type or no value"};
    }
    if (Problem problem = parseType(type, argument.type)) {
        return Refusal{*problem};
    }
    argument.value = text;
    return argument;
}

} // namespace

Attempt<CommandText> parseCommandText(std::string_view text) {
    if (text.size() >= kCutLength) {
        return Refusal{"the command is too long and may have been cut"};
    }
    if (std::any_of(text.begin(), text.end(), isControl)) {
        return Refusal{"the command holds a control character"};
    }
    CommandText command;
    bool more = false;
    command.method = takeUntil(text, ',', more);
    if (!isWord(command.method)) {
        return Refusal{"the command has no proper method name"};
    }
    while (more) {
        Attempt<CommandArgument> argument = parseArgument(takeUntil(text, ',', more));
        if (!argument) {
            return argument.refusal();
        }
        command.arguments.push_back(*argument);
    }
    return command;
}

} // namespace qelo::store
