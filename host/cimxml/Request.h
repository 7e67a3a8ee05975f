// A request of "CIM Operations over HTTP" (DMTF DSP0200) as it stands in its XML
// (DSP0201): read, checked for form, but not yet interpreted.
#pragma once

#include <cim/Class.h>
#include <cim/Instance.h>

#include <cstddef>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace qelo::cimxml {

// A body that is no acceptable request. `cimError` is the value for the HTTP header CIMError
// ("request-not-well-formed", "request-not-valid", "unsupported-protocol-version" ...) that
// goes with HTTP status 400 or, for what this server does not do, 501.
class RequestError : public std::runtime_error {
public:
    RequestError(unsigned int httpStatus, std::string cimError, const std::string& message)
        : std::runtime_error(message), httpStatus_(httpStatus), cimError_(std::move(cimError)) {}
    unsigned int httpStatus() const { return httpStatus_; }
    const std::string& cimError() const { return cimError_; }

private:
    unsigned int httpStatus_;
    std::string cimError_;
};

// A CLASSNAME element.
struct ClassName {
    std::string name;
};

// A parameter of an intrinsic method (IPARAMVALUE). Nothing: no value was given (NULL).
// Texts are those of VALUE, lists those of VALUE.ARRAY (an element may be null).
using TextList = std::vector<std::optional<std::string>>;
struct IntrinsicParameter {
    std::string name;
    std::variant<std::monostate, std::string, TextList, ClassName, cim::ObjectPath, cim::Instance,
                 cim::Class, cim::QualifierType>
        value;
};

// An argument of an extrinsic method (PARAMVALUE). Without a type in the request, scalars
// and arrays are strings and `typed` is false: a schema has to tell what they are.
struct ExtrinsicParameter {
    std::string name;
    cim::Value value;
    bool typed = false;
};

struct Request {
    std::string messageId;
    std::string protocolVersion; // "1.0" ...
    bool extrinsic = false;
    std::string method;     // as the client spelled it
    cim::ObjectPath target; // intrinsic: the namespace only; extrinsic: class or instance
    std::vector<IntrinsicParameter> intrinsicParameters;
    std::vector<ExtrinsicParameter> extrinsicParameters;
};

struct ReadLimits {
    std::size_t depth = 64;         // elements inside each other, embedded documents included
    std::size_t elements = 200'000; // in one document
};

// Reads the body of a request: UTF-8 (other encodings are refused), no document type
// declaration, no entities but the five of XML, one SIMPLEREQ. Keys without a TYPE attribute
// become strings, booleans, uint64, sint64 or real64, as VALUETYPE says. Names in paths are
// kept as the client spelled them. Throws RequestError.
Request parseRequest(std::string_view body, const ReadLimits& limits = {});

} // namespace qelo::cimxml
