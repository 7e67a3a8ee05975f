// The parameters of one intrinsic method (DMTF DSP0200), taken by name. Every function throws
// client::CimError 4 (invalid parameter) when the parameter is of another kind than asked for;
// names compare ignoring case.
#pragma once

#include <cimxml/Request.h>
#include <client/Connection.h>

#include <initializer_list>
#include <string>
#include <vector>

namespace qelo::server {

class IntrinsicParameters {
public:
    // Refuses a parameter that is given twice or is not among `known`.
    IntrinsicParameters(const cimxml::Request& request, std::initializer_list<const char*> known);

    // Absent and NULL are the default.
    bool flag(const char* name, bool byDefault) const;
    std::string text(const char* name) const;      // absent: empty
    std::string className(const char* name) const; // absent: empty
    client::PropertyList propertyList() const;     // of "PropertyList"
    cim::Value rawValue(const char* name) const;   // a text as string, a list as string array

    // These must be given.
    std::string requiredText(const char* name) const;
    std::string requiredClassName(const char* name) const;
    // The path of an instance, in the namespace of the request.
    cim::ObjectPath requiredInstanceName(const char* name) const;
    cim::Instance requiredInstance(const char* name) const;

private:
    const cimxml::IntrinsicParameter* find(const char* name) const;
    template <class Kind> const Kind* get(const char* name, const char* expected) const;
    template <class Kind> const Kind& require(const char* name, const char* expected) const;

    const cimxml::Request& request_;
};

} // namespace qelo::server
