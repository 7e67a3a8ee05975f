// Writes the answer to one request as XML (DMTF DSP0200, DSP0201), piece by piece: what is
// written can be sent at once, so that a long answer never stands in memory as a whole.
//
// Call order: begin(), any number of results, end(). Or error() alone, which is a whole
// answer. Every function appends to `out` and throws nothing but std::bad_alloc. Text that
// is not valid XML 1.0 UTF-8 (stray bytes, control characters) is written as U+FFFD, so the
// answer is always well-formed.
#pragma once

#include "Request.h"

#include <client/Connection.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace qelo::cimxml {

// What the elements inside IRETURNVALUE are, where one thing has several forms.
enum class InstanceForm {
    Plain,          // INSTANCE (GetInstance)
    Named,          // VALUE.NAMEDINSTANCE (EnumerateInstances)
    WithObjectPath, // VALUE.OBJECTWITHPATH (Associators, References, ExecQuery)
};
enum class PathForm {
    InstanceName, // INSTANCENAME (EnumerateInstanceNames, CreateInstance)
    ObjectPath,   // OBJECTPATH (AssociatorNames, ReferenceNames)
};

struct InstanceOptions {
    bool includeClassOrigin = false;
    bool includeQualifiers = false;
    // Of the instance's class, for qualifiers; may be null.
    const cim::Class* declaration = nullptr;
};

struct ClassOptions {
    bool localOnly = true;
    bool includeQualifiers = true;
    bool includeClassOrigin = false;
    client::PropertyList properties;
};

class ResponseWriter {
public:
    // `host` stands in paths that name none themselves; `nameSpace` likewise.
    ResponseWriter(const Request& request, std::string host, std::string nameSpace);

    // Before the first result; `hasResults`: whether the operation returns anything at all
    // (DeleteInstance and ModifyInstance do not).
    void begin(std::string& out, bool hasResults = true) const;
    void instance(std::string& out, const cim::Instance& instance, InstanceForm form,
                  const InstanceOptions& options) const;
    void path(std::string& out, const cim::ObjectPath& path, PathForm form) const;
    void className(std::string& out, std::string_view name) const;
    void declaration(std::string& out, const cim::Class& declaration,
                     const ClassOptions& options) const;
    void qualifierType(std::string& out, const cim::QualifierType& type) const;
    void value(std::string& out, const cim::Value& value) const; // GetProperty
    void end(std::string& out, bool hasResults = true) const;

    // The whole answer to an extrinsic method.
    void methodResult(std::string& out, const client::MethodResult& result) const;

    // A whole answer: the operation failed with this CIM status code and text.
    void error(std::string& out, unsigned int code, std::string_view description) const;

private:
    std::string messageId_;
    std::string method_;
    bool extrinsic_;
    std::string host_;
    std::string nameSpace_;
};

} // namespace qelo::cimxml
