// The CMPIResult of one operation: what the provider returns goes to the client's sink at
// once, converted to the host's values.
#pragma once

#include "Objects.h"

#include <cim/Instance.h>
#include <client/Connection.h>

#include <exception>
#include <optional>
#include <string>

namespace qelo::broker {

struct ResultObject : Object<CMPIResult, CMPIResultFT> {
    // What the operation answers.
    enum class Kind { Nothing, Instances, Paths, Value };

    explicit ResultObject(Kind answers)
        : Object(table, nullptr, Ownership::Contained), kind(answers) {}

    Kind kind;
    client::InstanceSink instanceSink;
    client::PathSink pathSink;
    client::PropertyList properties;       // instances reach the sink with these only
    std::string nameSpace;                 // for results that name none
    cim::Instance converted;               // the last instance, filled again for the next
    std::optional<cim::Value> value;       // Kind::Value
    bool done = false;                     // returnDone was called
    std::exception_ptr sinkFailure;        // thrown by a sink; the request is given up
    std::optional<client::CimError> error; // the first that returnError brought
    static const Table table;
    static constexpr const char* typeName = "CMPIResult";
};

} // namespace qelo::broker
