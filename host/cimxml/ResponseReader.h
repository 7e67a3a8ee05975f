// Reads the answer to one operation as it arrives, piece by piece: each result is handed on
// as soon as it is complete and then forgotten, so that an answer may be of any length.
#pragma once

#include "XmlReader.h"

#include <cim/Class.h>
#include <cim/Instance.h>
#include <client/Connection.h>

#include <functional>
#include <optional>
#include <string_view>

namespace qelo::cimxml {

class ElementReader;

// Where the elements inside IRETURNVALUE go. An answer with an element for which there is no
// function is refused.
struct ResponseSinks {
    std::function<void(cim::Instance)> instance;
    std::function<void(cim::ObjectPath)> path;
    std::function<void(cim::Class)> declaration;
    std::function<void(const std::string&)> className;
    std::function<void(cim::QualifierType)> qualifierType;
    std::function<void(cim::Value)> value; // untyped: strings and references
};

class ResponseReader {
public:
    // The limits concern one result, not the whole answer.
    static constexpr XmlLimits kLimits = {64, 200'000, std::size_t{64} << 20, 0};

    explicit ResponseReader(ResponseSinks sinks, const XmlLimits& limits = kLimits);

    // Both throw client::CimError: code 1 with a clear text for an answer that is cut short,
    // no XML or not what DSP0201 says, or whatever a sink throws. After that the reader is of
    // no further use. finish() also throws the error that the answer itself reports.
    void feed(std::string_view piece);
    void finish();

    // The result of an extrinsic method; to be called behind finish().
    const client::MethodResult& methodResult() const { return methodResult_; }

private:
    bool visit(const Element& element, const std::vector<Element>& around);
    void deliver(const Element& element);
    void readEnvelope(const Element& root);
    void readMethodResponse(const Element& element);

    ResponseSinks sinks_;
    XmlLimits limits_;
    XmlReader reader_;
    client::MethodResult methodResult_;
};

} // namespace qelo::cimxml
