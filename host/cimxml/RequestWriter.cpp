#include "RequestWriter.h"

#include "Characters.h"
#include "ElementWriter.h"

namespace qelo::cimxml {
namespace {

struct ParameterContent {
    std::string& out;

    void operator()(std::monostate) const {}
    void operator()(const std::string& text) const {
        out += "<VALUE>";
        appendText(out, text);
        out += "</VALUE>";
    }
    void operator()(const TextList& texts) const {
        out += "<VALUE.ARRAY>";
        for (const auto& text : texts) {
            if (text) {
                (*this)(*text);
            } else {
                out += "<VALUE.NULL/>";
            }
        }
        out += "</VALUE.ARRAY>";
    }
    void operator()(const ClassName& name) const {
        out += "<CLASSNAME";
        appendAttribute(out, "NAME", name.name);
        out += "/>";
    }
    void operator()(const cim::ObjectPath& path) const {
        if (path.nameSpace().empty()) {
            appendInstanceName(out, path);
        } else {
            out += "<VALUE.REFERENCE>";
            appendPath(out, path);
            out += "</VALUE.REFERENCE>";
        }
    }
    void operator()(const cim::Instance& instance) const {
        if (instance.path().keys().empty()) {
            appendInstance(out, instance);
            return;
        }
        out += "<VALUE.NAMEDINSTANCE>";
        appendInstanceName(out, instance.path());
        appendInstance(out, instance);
        out += "</VALUE.NAMEDINSTANCE>";
    }
    void operator()(const cim::Class& declaration) const {
        ClassOptions everything;
        everything.localOnly = false;
        everything.includeClassOrigin = true;
        appendClass(out, declaration, everything);
    }
    void operator()(const cim::QualifierType& type) const { appendQualifierType(out, type); }
};

void appendIntrinsic(std::string& out, const Request& request) {
    out += "<IMETHODCALL";
    appendAttribute(out, "NAME", request.method);
    out += '>';
    appendLocalNameSpace(out, request.target.nameSpace());
    for (const IntrinsicParameter& parameter : request.intrinsicParameters) {
        out += "<IPARAMVALUE";
        appendAttribute(out, "NAME", parameter.name);
        out += '>';
        std::visit(ParameterContent{out}, parameter.value);
        out += "</IPARAMVALUE>";
    }
    out += "</IMETHODCALL>";
}

// The target with its namespace, but without a host: the request goes there.
void appendExtrinsic(std::string& out, const Request& request) {
    out += "<METHODCALL";
    appendAttribute(out, "NAME", request.method);
    out += '>';
    cim::ObjectPath target = request.target;
    target.setHost("");
    appendPath(out, target);
    for (const ExtrinsicParameter& parameter : request.extrinsicParameters) {
        appendArgument(out, parameter.name, parameter.value, parameter.typed);
    }
    out += "</METHODCALL>";
}

} // namespace

void writeRequest(std::string& out, const Request& request) {
    beginMessage(out, request.messageId);
    out += "<SIMPLEREQ>";
    if (request.extrinsic) {
        appendExtrinsic(out, request);
    } else {
        appendIntrinsic(out, request);
    }
    out += "</SIMPLEREQ>";
    endMessage(out);
}

} // namespace qelo::cimxml
