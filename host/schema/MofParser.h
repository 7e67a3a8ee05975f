// The grammar of MOF. What a text declares goes straight into a repository.
#pragma once

#include "MofTokens.h"

#include <map>

namespace qelo::schema {

// An include that cannot be had; the parser adds the position.
class IncludeError : public SchemaError {
public:
    using SchemaError::SchemaError;
};

// What the files of one compilation share.
class MofCompilation final : public ReferenceSource {
public:
    MofCompilation(std::string nameSpace, const IncludeResolver& include,
                   ClassRepository& repository)
        : nameSpace_(std::move(nameSpace)), include_(include), repository_(repository) {
        repository_.addNameSpace(nameSpace_);
    }

    // Reads a text, and through it what it includes.
    void read(const MofSource& source);
    // What an include asks for; throws IncludeError when it cannot be had.
    void include(const std::string& including, const std::string& target);

    ClassRepository& repository() { return repository_; }
    const std::string& nameSpace() const { return nameSpace_; }
    void setNameSpace(const std::string& nameSpace);

    void setAlias(const std::string& name, const cim::ObjectPath& path);
    const cim::ObjectPath* alias(std::string_view name) const override;
    cim::ObjectPath reference(const std::string& text, std::string& problem) const override;

private:
    std::string nameSpace_;
    const IncludeResolver& include_;
    ClassRepository& repository_;
    std::map<std::string, cim::ObjectPath> aliases_; // by name in lower case
    std::size_t depth_ = 0;
    std::size_t includes_ = 0;
    std::size_t size_ = 0;
};

class MofParser {
public:
    // Both must outlive the parser.
    MofParser(const MofSource& source, MofCompilation& compilation)
        : source_(source), compilation_(compilation), tokens_(source) {}

    // Everything up to the end of the text. Throws SchemaError.
    void parse();

private:
    // A qualifier as it is written.
    struct WrittenQualifier {
        std::string name;
        std::optional<Initializer> value;
        std::vector<Token> flavors;
        Position position;
    };

    void production();
    void pragma();

    // MofQualifiers.cpp
    void qualifierDeclaration();
    std::uint32_t scopes();
    void applyFlavor(const Token& word, cim::QualifierFlavor& flavor) const;
    std::vector<WrittenQualifier> qualifierList();
    WrittenQualifier writtenQualifier();
    std::vector<cim::Qualifier> qualifiers(const std::vector<WrittenQualifier>& written,
                                           std::uint32_t scope) const;
    cim::Qualifier qualifier(const WrittenQualifier& written, std::uint32_t scope) const;
    cim::Value qualifierValue(const WrittenQualifier& written,
                              const cim::QualifierType* type) const;

    // MofClasses.cpp
    void classDeclaration(const std::vector<WrittenQualifier>& written);
    void feature(cim::Class& declared);
    // The type in front of a name, which goes to `element`; whether it is a reference.
    bool elementType(cim::TypedElement& element);
    void property(cim::PropertyDeclaration property, cim::Class& declared);
    void method(const cim::TypedElement& head, cim::Class& declared);
    cim::ParameterDeclaration parameter();

    // MofInstances.cpp
    void instanceDeclaration();
    void instanceProperty(const cim::Class& known, cim::Instance& instance);

    cim::Value typed(const Initializer& initializer, const cim::TypedElement& element) const;

    // Runs what speaks to the repository; what it refuses is told with the position.
    template <class Action> void at(const Position& position, Action action) const;

    const MofSource& source_;
    MofCompilation& compilation_;
    MofTokens tokens_;
};

template <class Action> void MofParser::at(const Position& position, Action action) const {
    std::string problem;
    try {
        action();
        return;
    } catch (const SchemaError& error) {
        problem = error.what();
    }
    tokens_.fail(position, problem);
}

} // namespace qelo::schema
