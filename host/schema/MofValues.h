// Initialisers of MOF: as they are written, and as values of a type.
#pragma once

#include "MofLexer.h"

#include <cim/ObjectPath.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::schema {

struct Initializer {
    // One unless it is an array. Strings in a row are one literal already; TRUE, FALSE and
    // NULL are names.
    std::vector<Token> literals;
    bool array = false;
    Position position;
};

// What gives aliases and texts of object paths a meaning: the path that an alias stands for
// (null: there is none), and the namespace of paths that name none.
class ReferenceSource {
public:
    virtual ~ReferenceSource() = default;
    virtual const cim::ObjectPath* alias(std::string_view name) const = 0;
    virtual cim::ObjectPath reference(const std::string& text, std::string& problem) const = 0;
};

// Whether a token is that keyword; keywords ignore case.
bool isKeyword(const Token& token, std::string_view keyword);

// The value of an initialiser in a type; nothing and a `problem` when it does not fit. NULL
// fits everywhere; a single literal does not make an array.
std::optional<cim::Value> typedValue(const Initializer& initializer, cim::Type type, bool array,
                                     const ReferenceSource& references, std::string& problem);

// The type that the value of an undeclared qualifier tells; nothing when it tells none.
std::optional<cim::Type> inferredType(const Initializer& initializer);

} // namespace qelo::schema
