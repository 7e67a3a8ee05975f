#include "ResponseWriter.h"

#include "Characters.h"
#include "ElementWriter.h"

namespace qelo::cimxml {
namespace {

void appendClassName(std::string& out, std::string_view name) {
    out += "<CLASSNAME";
    appendAttribute(out, "NAME", name);
    out += "/>";
}

void appendNamedInstance(std::string& out, const cim::Instance& instance,
                         const InstanceOptions& options) {
    Pieces pieces(out);
    pieces.add("<VALUE.NAMEDINSTANCE>");
    addInstanceName(pieces, instance.path());
    addInstance(pieces, instance, options);
    pieces.add("</VALUE.NAMEDINSTANCE>");
    pieces.flush();
}

void beginResponse(std::string& out, std::string_view messageId, bool extrinsic,
                   std::string_view method) {
    beginMessage(out, messageId);
    out += extrinsic ? "<SIMPLERSP><METHODRESPONSE" : "<SIMPLERSP><IMETHODRESPONSE";
    appendAttribute(out, "NAME", method);
    out += '>';
}

void endResponse(std::string& out, bool extrinsic) {
    out += extrinsic ? "</METHODRESPONSE></SIMPLERSP>" : "</IMETHODRESPONSE></SIMPLERSP>";
    endMessage(out);
}

} // namespace

void beginMessage(std::string& out, std::string_view messageId) {
    out += "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n"
           "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE";
    appendAttribute(out, "ID", messageId);
    out += " PROTOCOLVERSION=\"1.0\">";
}

void endMessage(std::string& out) { out += "</MESSAGE></CIM>\n"; }

ResponseWriter::ResponseWriter(const Request& request, std::string host, std::string nameSpace)
    : messageId_(request.messageId), method_(request.method), extrinsic_(request.extrinsic),
      host_(std::move(host)), nameSpace_(std::move(nameSpace)) {}

void ResponseWriter::begin(std::string& out, bool hasResults) const {
    beginResponse(out, messageId_, extrinsic_, method_);
    out += hasResults ? "<IRETURNVALUE>" : "";
}

void ResponseWriter::end(std::string& out, bool hasResults) const {
    out += hasResults ? "</IRETURNVALUE>" : "";
    endResponse(out, extrinsic_);
}

void ResponseWriter::instance(std::string& out, const cim::Instance& instance, InstanceForm form,
                              const InstanceOptions& options) const {
    switch (form) {
    case InstanceForm::Plain:
        appendInstance(out, instance, options);
        return;
    case InstanceForm::Named:
        appendNamedInstance(out, instance, options);
        return;
    case InstanceForm::WithObjectPath:
        out += "<VALUE.OBJECTWITHPATH>";
        appendInstancePath(out, instance.path(), host_, nameSpace_);
        appendInstance(out, instance, options);
        out += "</VALUE.OBJECTWITHPATH>";
        return;
    }
}

void ResponseWriter::path(std::string& out, const cim::ObjectPath& path, PathForm form) const {
    if (form == PathForm::InstanceName) {
        appendInstanceName(out, path);
        return;
    }
    out += "<OBJECTPATH>";
    appendFullPath(out, path, host_, nameSpace_);
    out += "</OBJECTPATH>";
}

void ResponseWriter::className(std::string& out, std::string_view name) const {
    appendClassName(out, name);
}

void ResponseWriter::declaration(std::string& out, const cim::Class& declaration,
                                 const ClassOptions& options) const {
    appendClass(out, declaration, options);
}

void ResponseWriter::qualifierType(std::string& out, const cim::QualifierType& type) const {
    appendQualifierType(out, type);
}

void ResponseWriter::value(std::string& out, const cim::Value& value) const {
    appendValue(out, value);
}

void ResponseWriter::methodResult(std::string& out, const client::MethodResult& result) const {
    beginResponse(out, messageId_, extrinsic_, method_);
    if (!result.returnValue.isNull()) {
        out += "<RETURNVALUE";
        appendType(out, "PARAMTYPE", result.returnValue.type());
        out += '>';
        appendValue(out, result.returnValue);
        out += "</RETURNVALUE>";
    }
    for (const auto& [name, value] : result.out) {
        appendArgument(out, name, value, true);
    }
    endResponse(out, extrinsic_);
}

void ResponseWriter::error(std::string& out, unsigned int code,
                           std::string_view description) const {
    beginResponse(out, messageId_, extrinsic_, method_);
    out += "<ERROR";
    appendAttribute(out, "CODE", std::to_string(code));
    appendAttribute(out, "DESCRIPTION", description);
    out += "/>";
    endResponse(out, extrinsic_);
}

} // namespace qelo::cimxml
