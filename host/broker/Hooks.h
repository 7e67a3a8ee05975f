// Where the rest of the host plugs into the broker: class schema, log, translations. Every
// hook may be left empty; the comment at each says what happens then. Hooks are called from
// any thread, several at once, and are set before the first request.
#pragma once

#include <cim/Class.h>
#include <cim/Instance.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace qelo::broker {

struct SchemaHooks {
    // Whether `sub` is `super` or derived from it. Empty: only equal names (ignoring case).
    std::function<bool(const std::string& nameSpace, const std::string& sub,
                       const std::string& super)>
        isA;

    // Whether the schema has that namespace. Empty: one exists when a provider serves it.
    std::function<bool(const std::string& nameSpace)> hasNameSpace;

    // The declaration of a class, valid and unchanged as long as the broker; null for a class
    // that the schema does not know, whose instances may have any properties. Empty: no class
    // is known.
    std::function<const cim::Class*(const std::string& nameSpace, const std::string& className)>
        findClass;

    // The static instances of a class and its subclasses. Empty: there are none.
    std::function<std::vector<const cim::Instance*>(const std::string& nameSpace,
                                                    const std::string& className)>
        instances;

    // For classes that findClass does not know: the names of the key properties, or nothing.
    // Empty: not known either.
    std::function<std::optional<std::vector<std::string>>(const std::string& nameSpace,
                                                          const std::string& className)>
        keyNames;

    // Whether the schema has that class. Empty: a class exists when a provider serves it.
    std::function<bool(const std::string& nameSpace, const std::string& className)> hasClass;
};

struct LogHooks {
    // A provider's trace message; `level` is a CMPILevel. Empty: traces are dropped.
    std::function<void(int level, const std::string& component, const std::string& text)> trace;

    // A provider's log message, or the broker's own; `severity` is a CMPISeverity. Empty: one
    // line on standard error.
    std::function<void(int severity, const std::string& id, const std::string& text)> log;
};

// The messages of one translated file.
class MessageCatalog {
public:
    virtual ~MessageCatalog() = default;

    // The text with that id, or nothing.
    virtual std::optional<std::string> text(const std::string& id) const = 0;
};

struct BrokerHooks {
    SchemaHooks schema;
    LogHooks log;

    // The catalog of that name, or null when there is none. Empty: there are none.
    std::function<std::shared_ptr<const MessageCatalog>(const std::string& file)> openCatalog;
};

} // namespace qelo::broker
