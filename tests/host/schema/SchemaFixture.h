// A repository that a test fills from MOF text.
#pragma once

#include <schema/Mof.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <string>
#include <vector>

namespace qelo::schema::testing {

inline constexpr const char* nameSpace = "root/test";

class SchemaTest : public ::testing::Test {
protected:
    // Text that other texts may include, by name.
    std::map<std::string, std::string> files;

    void read(const std::string& text) {
        readMof({"test.mof", text}, nameSpace, resolver(), repository);
    }

    IncludeResolver resolver() {
        return [this](const std::string&, const std::string& target) {
            const auto found = files.find(target);
            if (found == files.end()) {
                throw std::runtime_error("no such file");
            }
            return MofSource{found->first, found->second};
        };
    }

    // What is wrong with the text; empty when nothing is.
    std::string errorOf(const std::string& text) {
        try {
            read(text);
        } catch (const SchemaError& error) {
            return error.what();
        }
        return {};
    }

    const cim::Class& known(const char* className) {
        const cim::Class* found = repository.find(nameSpace, className);
        if (found == nullptr) {
            throw std::runtime_error(std::string("no class ") + className);
        }
        return *found;
    }
    const cim::PropertyDeclaration& property(const char* className, const char* name) {
        const cim::PropertyDeclaration* found = known(className).property(name);
        if (found == nullptr) {
            throw std::runtime_error(std::string("no property ") + name);
        }
        return *found;
    }
    std::vector<std::string> names(const char* className, bool deep) {
        std::vector<std::string> found;
        for (const cim::Class* one : repository.subclasses(nameSpace, className, deep)) {
            found.push_back(one->name);
        }
        return found;
    }

    ClassRepository repository;
};

// The qualifiers that most texts use.
inline constexpr const char* standardQualifiers = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride, ToSubclass);
Qualifier Abstract : boolean = false, Scope(class, association, indication), Flavor(Restricted);
Qualifier Override : string = NULL, Scope(property, reference, method), Flavor(Restricted);
Qualifier Description : string = NULL, Scope(any), Flavor(EnableOverride, ToSubclass, Translatable);
Qualifier MaxLen : uint32 = NULL, Scope(property, method, parameter);
Qualifier In : boolean = true, Scope(parameter), Flavor(DisableOverride, ToSubclass);
Qualifier ValueMap : string[], Scope(property, method, parameter);
)";

} // namespace qelo::schema::testing
