#include "ElementReader.h"
#include "Request.h"
#include "XmlReader.h"

namespace qelo::cimxml {
namespace {

constexpr unsigned int kBadRequest = 400;
constexpr unsigned int kNotImplemented = 501;

constexpr std::size_t kMostArguments = 256;

// The version of a standard: all that is asked of it is its first number.
void requireMajorVersion(std::string_view version, char major, const char* cimError) {
    version = trimmed(version);
    const bool accepted =
        version.empty() || (version[0] == major && (version.size() == 1 || version[1] == '.'));
    if (!accepted) {
        throw RequestError(kNotImplemented, cimError,
                           std::string(cimError) + ": " + std::string(version.substr(0, 32)));
    }
}

// Reads the parts of one request.
class Parser {
public:
    explicit Parser(const ReadLimits& limits) : reader_(limits) {}

    Request request(const Element& root) {
        if (!root.is("CIM")) {
            throw NotValid("CIM is expected instead of " + root.name);
        }
        requireMajorVersion(root.attribute("CIMVERSION"), '2', "unsupported-cim-version");
        requireMajorVersion(root.attribute("DTDVERSION"), '2', "unsupported-dtd-version");
        return message(root.onlyChild());
    }

private:
    static Request start(const Element& element) {
        if (!element.is("MESSAGE")) {
            throw NotValid("MESSAGE is expected instead of " + element.name);
        }
        Request request;
        request.messageId = element.attribute("ID");
        const std::string_view version = trimmed(element.attribute("PROTOCOLVERSION"));
        requireMajorVersion(version, '1', "unsupported-protocol-version");
        request.protocolVersion = version.empty() ? "1.0" : version;
        return request;
    }

    Request message(const Element& element) {
        Request request = start(element);
        const Element& content = element.onlyChild();
        if (content.is("MULTIREQ")) {
            throw RequestError(kNotImplemented, "multiple-requests-unsupported",
                               "several operations in one request are not supported");
        }
        if (content.is("SIMPLEEXPREQ") || content.is("MULTIEXPREQ")) {
            throw RequestError(kNotImplemented, "unsupported-operation",
                               "export messages are not supported");
        }
        if (!content.is("SIMPLEREQ")) {
            refuseChild(element, content);
        }
        call(request, simpleRequest(content));
        return request;
    }

    // A CORRELATOR may stand before the call; it means nothing to a server without sessions.
    static const Element& simpleRequest(const Element& element) {
        const Element* found = nullptr;
        for (const Element& child : element.children) {
            if (child.is("CORRELATOR")) {
                continue;
            }
            if (found != nullptr || (!child.is("IMETHODCALL") && !child.is("METHODCALL"))) {
                refuseChild(element, child);
            }
            found = &child;
        }
        if (found == nullptr) {
            throw NotValid("SIMPLEREQ calls no method");
        }
        return *found;
    }

    void call(Request& request, const Element& element) {
        request.extrinsic = element.is("METHODCALL");
        request.method = element.requiredAttribute("NAME");
        if (element.children.empty()) {
            throw NotValid(element.name + " does not say what it is for");
        }
        request.target = target(element.children.front(), request.extrinsic);
        for (std::size_t i = 1; i < element.children.size(); ++i) {
            const Element& child = element.children[i];
            if (!child.is(request.extrinsic ? "PARAMVALUE" : "IPARAMVALUE")) {
                refuseChild(element, child);
            }
            if (request.extrinsic) {
                request.extrinsicParameters.push_back(extrinsic(child));
                refuseRepetition(request.extrinsicParameters);
            } else {
                request.intrinsicParameters.push_back(parameter(child));
            }
        }
    }

    // Whether the last one has the name of one before it.
    static void refuseRepetition(const std::vector<ExtrinsicParameter>& parameters) {
        const auto& last = parameters.back();
        for (std::size_t i = 0; i + 1 < parameters.size(); ++i) {
            if (cim::sameName(parameters[i].name, last.name)) {
                throw NotValid("the argument " + last.name + " is given twice");
            }
        }
        if (parameters.size() > kMostArguments) {
            throw NotValid("there are too many arguments");
        }
    }

    cim::ObjectPath target(const Element& element, bool extrinsic) {
        if (!extrinsic) {
            return {ElementReader::nameSpace(element), ""};
        }
        if (!element.is("LOCALCLASSPATH") && !element.is("LOCALINSTANCEPATH")) {
            throw NotValid("METHODCALL must name a class or an instance");
        }
        return reader_.path(element);
    }

    IntrinsicParameter parameter(const Element& element) {
        IntrinsicParameter result;
        result.name = element.requiredAttribute("NAME");
        if (element.children.empty()) {
            return result;
        }
        const Element& child = element.onlyChild();
        if (child.is("VALUE")) {
            result.value = reader_.value(child, cim::Type::String).asString();
        } else if (child.is("VALUE.ARRAY")) {
            result.value = texts(child);
        } else if (child.is("CLASSNAME")) {
            result.value = ClassName{child.requiredAttribute("NAME")};
        } else if (child.is("CLASS")) {
            result.value = reader_.declaration(child);
        } else if (child.is("QUALIFIER.DECLARATION")) {
            result.value = reader_.qualifierType(child);
        } else if (child.is("VALUE.REFERENCE") || ElementReader::isPath(child)) {
            result.value = reader_.path(child);
        } else if (!child.is("VALUE.NULL")) {
            result.value = reader_.instance(child);
        }
        return result;
    }

    TextList texts(const Element& element) {
        TextList result;
        const cim::Value array = reader_.value(element, cim::Type::String);
        for (const cim::Value& text : array.asArray()) {
            result.push_back(text.isNull() ? std::nullopt : std::optional(text.asString()));
        }
        return result;
    }

    ExtrinsicParameter extrinsic(const Element& element) {
        ElementReader::Argument argument = reader_.argument(element);
        return {element.requiredAttribute("NAME"), std::move(argument.value), argument.typed};
    }

    ElementReader reader_;
};

} // namespace

Request parseRequest(std::string_view body, const ReadLimits& limits) {
    try {
        XmlLimits xmlLimits;
        xmlLimits.depth = limits.depth;
        xmlLimits.elements = limits.elements;
        XmlReader reader(xmlLimits);
        reader.feed(body);
        return Parser(limits).request(reader.finish());
    } catch (const NotWellFormed& error) {
        throw RequestError(kBadRequest, "request-not-well-formed", error.what());
    } catch (const NotValid& error) {
        throw RequestError(kBadRequest, "request-not-valid", error.what());
    }
}

} // namespace qelo::cimxml
