#include "Arguments.h"

#include "CommandContext.h"
#include "KnownClasses.h"

#include <cim/ValueParser.h>

#include <algorithm>
#include <utility>

namespace qelo::cli {
namespace {

constexpr std::pair<const char*, const char*> kTwoLetterOptions[] = {
    {"-ac", "--assoc-class"}, {"-rc", "--result-class"}, {"-rr", "--result-role"}};

std::string inQuotes(const std::string& text) { return "\"" + text + "\""; }

bool isLetter(char c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_'; }

// The keys of an association are references; on the command line they are quoted texts.
cim::ObjectPath withReferences(const cim::ObjectPath& path, const Options& options) {
    cim::ObjectPath result = path;
    for (const auto& key : path.keys()) {
        if (key.value.type() == cim::Type::String) {
            result.setKey(key.name,
                          cim::Value::reference(anyPathOf(key.value.asString(), options)));
        }
    }
    return result;
}

// An argument of a method as errors show it: passwords without their value.
std::string shown(const std::string& name, const std::string& whole) {
    return "argument " + (cim::sameName(name, "UserPassword") ? name : inQuotes(whole));
}

cim::Value argumentValue(const std::string& name, const std::string& whole,
                         const std::string& typeName, const std::string& text) {
    const auto type = cim::typeOfName(typeName);
    if (!type) {
        throw UsageError(shown(name, whole) + ": no such type: " + inQuotes(typeName));
    }
    std::string error;
    const auto value = cim::parseValue(*type, text, error);
    if (!value) {
        throw UsageError(shown(name, whole) + ": " + error);
    }
    return *value;
}

// `number`: where it stands, for people.
std::pair<std::string, cim::Value> argumentOf(const std::string& text, std::size_t number) {
    const std::size_t equals = text.find('=');
    if (equals == std::string::npos) {
        throw UsageError("argument " + std::to_string(number) +
                         " of the method: name=value is expected");
    }
    const std::string declaration = text.substr(0, equals);
    const std::size_t colon = std::min(declaration.find(':'), declaration.size());
    const std::string name = declaration.substr(0, colon);
    if (!isName(name)) {
        throw UsageError("argument " + std::to_string(number) +
                         " of the method: not a name: " + inQuotes(name));
    }
    const bool typed = colon != declaration.size();
    return {name, argumentValue(name, text, typed ? declaration.substr(colon + 1) : "string",
                                text.substr(equals + 1))};
}

} // namespace

std::vector<std::string> spelledOut(int count, const char* const* arguments) {
    std::vector<std::string> result;
    bool options = true;
    for (int i = 1; i < count; ++i) {
        std::string text = arguments[i];
        options = options && text != "--";
        for (const auto& [shortForm, longForm] : kTwoLetterOptions) {
            if (options && text == shortForm) {
                text = longForm;
            }
        }
        result.push_back(std::move(text));
    }
    return result;
}

cim::ObjectPath anyPathOf(const std::string& text, const Options& options) {
    std::string error;
    auto path = cim::ObjectPath::parse(text, error);
    if (!path) {
        throw UsageError("object path " + inQuotes(text) + ": " + error);
    }
    if (path->nameSpace().empty()) {
        path->setNameSpace(options.nameSpace);
    }
    return isKnownAssociation(path->className()) ? withReferences(*path, options) : *path;
}

cim::ObjectPath classPathOf(const std::string& text, const Options& options) {
    cim::ObjectPath path = anyPathOf(text, options);
    if (!path.keys().empty()) {
        throw UsageError("a class is expected, not an instance: " + inQuotes(text));
    }
    return path;
}

cim::ObjectPath instancePathOf(const std::string& text, const Options& options) {
    cim::ObjectPath path = anyPathOf(text, options);
    if (path.keys().empty()) {
        throw UsageError("the path of an instance is expected (CLASS.Key=\"value\",...): " +
                         inQuotes(text));
    }
    return path;
}

client::PropertyList propertyListOf(bool given, const std::vector<std::string>& names) {
    if (!given) {
        return std::nullopt;
    }
    std::vector<std::string> list;
    for (const std::string& name : names) {
        if (name.empty()) {
            continue;
        }
        if (!isName(name)) {
            throw UsageError("not a property name: " + inQuotes(name));
        }
        list.push_back(name);
    }
    return list;
}

client::Arguments methodArgumentsOf(const std::vector<std::string>& texts) {
    client::Arguments arguments;
    for (const std::string& text : texts) {
        auto argument = argumentOf(text, arguments.size() + 1);
        for (const auto& [name, value] : arguments) {
            if (cim::sameName(name, argument.first)) {
                throw UsageError(shown(name, text) + ": the name is given twice");
            }
        }
        arguments.push_back(std::move(argument));
    }
    return arguments;
}

bool isName(const std::string& text) {
    return !text.empty() && isLetter(text.front()) &&
           std::all_of(text.begin(), text.end(),
                       [](char c) { return isLetter(c) || (c >= '0' && c <= '9'); });
}

} // namespace qelo::cli
