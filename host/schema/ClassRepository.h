// The classes that an object manager knows, by namespace. Filled once from MOF files, then
// only read: every const function may be called from several threads at once.
//
// Classes are stored resolved: properties, methods and qualifiers of the superclasses are
// part of each class, marked as propagated, with the class that introduced them as origin.
#pragma once

#include <cim/Class.h>
#include <cim/Instance.h>

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::schema {

class ClassRepository {
public:
    ClassRepository();
    ~ClassRepository();
    ClassRepository(ClassRepository&&) noexcept;
    ClassRepository& operator=(ClassRepository&&) noexcept;

    // Namespaces compare ignoring case and slashes at their ends.
    void addNameSpace(std::string_view nameSpace);
    bool hasNameSpace(std::string_view nameSpace) const;
    std::vector<std::string> nameSpaces() const; // in the order in which they were added

    // Adds a class as its MOF declares it (nothing inherited yet) and resolves it; an equal
    // declaration of a class that is there already changes nothing. SchemaError (Mof.h) when
    // the superclass is not known, the class exists otherwise, or it contradicts its
    // superclass.
    void add(std::string_view nameSpace, cim::Class declared);
    void add(std::string_view nameSpace, cim::QualifierType type);
    // A static instance; its keys are taken from its class, and properties that it does not
    // give a value from their defaults. Returns its path.
    cim::ObjectPath add(std::string_view nameSpace, const cim::Instance& instance);

    // The resolved class, or null. Valid as long as the repository.
    const cim::Class* find(std::string_view nameSpace, std::string_view className) const;
    const cim::QualifierType* findQualifierType(std::string_view nameSpace,
                                                std::string_view name) const;
    std::vector<const cim::QualifierType*> qualifierTypes(std::string_view nameSpace) const;

    // Whether `sub` is `super` or derived from it. False for classes that are not known.
    bool isA(std::string_view nameSpace, std::string_view sub, std::string_view super) const;

    // The subclasses of a class (empty name: the classes without superclass), one level or
    // all; every class stands behind its superclass.
    std::vector<const cim::Class*> subclasses(std::string_view nameSpace,
                                              std::string_view className, bool deep) const;

    // The names of the key properties, in the order of the declaration.
    std::vector<std::string> keyNames(const cim::Class& known) const;

    // The static instances of exactly that class.
    std::vector<const cim::Instance*> instances(std::string_view nameSpace,
                                                std::string_view className) const;

private:
    class Impl;
    std::unique_ptr<Impl> impl_;
};

} // namespace qelo::schema
