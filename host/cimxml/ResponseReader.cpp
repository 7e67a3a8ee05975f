#include "ResponseReader.h"

#include "ElementReader.h"

#include <cim/ValueParser.h>

namespace qelo::cimxml {
namespace {

using client::CimError;

constexpr unsigned int kFailed = 1;

ReadLimits readLimits(const XmlLimits& limits) { return {limits.depth, limits.elements}; }

// CIM, MESSAGE, SIMPLERSP, IMETHODRESPONSE, IRETURNVALUE
bool isReturnValue(const std::vector<Element>& around) {
    constexpr std::size_t kDepth = 5;
    return around.size() == kDepth && around.back().is("IRETURNVALUE");
}

// The CIM status code that an answer reports; one that cannot be read is a failure as well.
[[noreturn]] void throwError(const Element& element) {
    std::string problem;
    const auto code =
        cim::parseValue(cim::Type::UInt32, trimmed(element.attribute("CODE")), problem);
    const auto number = code ? static_cast<unsigned int>(code->asUnsigned()) : 0;
    throw CimError(number == 0 ? kFailed : number, std::string(element.attribute("DESCRIPTION")));
}

// Translates what reading throws. What a sink throws passes.
template <class Action> void translated(Action action) {
    try {
        action();
    } catch (const NotWellFormed& error) {
        throw CimError(kFailed, std::string("the answer is cut short or no XML: ") + error.what());
    } catch (const NotValid& error) {
        throw CimError(kFailed, std::string("the answer cannot be understood: ") + error.what());
    }
}

template <class Sink, class Read>
void hand(const Sink& sink, const Element& element, const Read& read) {
    if (!sink) {
        throw NotValid(element.name + " is no result of this operation");
    }
    sink(read());
}

} // namespace

ResponseReader::ResponseReader(ResponseSinks sinks, const XmlLimits& limits)
    : sinks_(std::move(sinks)), limits_(limits),
      reader_(limits, [this](const Element& element, const std::vector<Element>& around) {
          return visit(element, around);
      }) {}

void ResponseReader::feed(std::string_view piece) {
    translated([&] { reader_.feed(piece); });
}

void ResponseReader::finish() {
    translated([&] { readEnvelope(reader_.finish()); });
}

bool ResponseReader::visit(const Element& element, const std::vector<Element>& around) {
    if (!isReturnValue(around)) {
        return false;
    }
    deliver(element);
    return true;
}

void ResponseReader::deliver(const Element& element) {
    ElementReader reader(readLimits(limits_));
    if (element.is("CLASSNAME")) {
        hand(sinks_.className, element, [&] { return element.requiredAttribute("NAME"); });
    } else if (ElementReader::isPath(element)) {
        hand(sinks_.path, element, [&] { return reader.path(element); });
    } else if (element.is("QUALIFIER.DECLARATION")) {
        hand(sinks_.qualifierType, element, [&] { return reader.qualifierType(element); });
    } else if (ElementReader::isValue(element)) {
        hand(sinks_.value, element, [&] { return reader.value(element, cim::Type::String); });
    } else if (ElementReader::holdsClass(element)) {
        hand(sinks_.declaration, element, [&] { return reader.declaration(element); });
    } else {
        hand(sinks_.instance, element, [&] { return reader.instance(element); });
    }
}

void ResponseReader::readEnvelope(const Element& root) {
    if (!root.is("CIM")) {
        throw NotValid("CIM is expected instead of " + root.name);
    }
    const Element& response = root.require("MESSAGE").require("SIMPLERSP").onlyChild();
    if (const Element* error = response.find("ERROR")) {
        throwError(*error);
    }
    if (response.is("METHODRESPONSE")) {
        readMethodResponse(response);
    } else if (!response.is("IMETHODRESPONSE")) {
        throw NotValid(response.name + " is no answer to an operation");
    }
}

void ResponseReader::readMethodResponse(const Element& element) {
    ElementReader reader(readLimits(limits_));
    for (const Element& child : element.children) {
        cim::Value value = reader.argument(child).value;
        if (child.is("RETURNVALUE")) {
            methodResult_.returnValue = std::move(value);
        } else if (child.is("PARAMVALUE")) {
            methodResult_.out.emplace_back(child.requiredAttribute("NAME"), std::move(value));
        } else {
            refuseChild(element, child);
        }
    }
}

} // namespace qelo::cimxml
