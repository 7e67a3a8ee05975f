// Requests as clients write them, for tests.
#pragma once

#include <algorithm>
#include <string>

namespace qelo::server {

inline std::string nameSpaceElement(const std::string& nameSpace) {
    std::string text = "<LOCALNAMESPACEPATH>";
    std::size_t at = 0;
    while (at <= nameSpace.size()) {
        const std::size_t slash = std::min(nameSpace.find('/', at), nameSpace.size());
        text += "<NAMESPACE NAME=\"" + nameSpace.substr(at, slash - at) + "\"/>";
        at = slash + 1;
    }
    return text + "</LOCALNAMESPACEPATH>";
}

inline std::string messageElement(const std::string& content) {
    return "<?xml version=\"1.0\" encoding=\"utf-8\"?>"
           "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"4711\" "
           "PROTOCOLVERSION=\"1.0\"><SIMPLEREQ>" +
           content + "</SIMPLEREQ></MESSAGE></CIM>";
}

// `parameters`: IPARAMVALUE elements.
inline std::string intrinsicRequest(const std::string& method, const std::string& parameters,
                                    const std::string& nameSpace = "root/test") {
    return messageElement("<IMETHODCALL NAME=\"" + method + "\">" + nameSpaceElement(nameSpace) +
                          parameters + "</IMETHODCALL>");
}

inline std::string classNameParameter(const std::string& className) {
    return "<IPARAMVALUE NAME=\"ClassName\"><CLASSNAME NAME=\"" + className + "\"/></IPARAMVALUE>";
}

inline std::string textParameter(const std::string& name, const std::string& value) {
    return "<IPARAMVALUE NAME=\"" + name + "\"><VALUE>" + value + "</VALUE></IPARAMVALUE>";
}

inline std::string instanceNameElement(const std::string& id) {
    return "<INSTANCENAME CLASSNAME=\"TEST_Thing\"><KEYBINDING NAME=\"Id\"><KEYVALUE "
           "VALUETYPE=\"string\">" +
           id + "</KEYVALUE></KEYBINDING></INSTANCENAME>";
}

inline std::string instanceNameParameter(const std::string& name, const std::string& id) {
    return "<IPARAMVALUE NAME=\"" + name + "\">" + instanceNameElement(id) + "</IPARAMVALUE>";
}

// `parameters`: PARAMVALUE elements.
inline std::string extrinsicRequest(const std::string& method, const std::string& id,
                                    const std::string& parameters,
                                    const std::string& nameSpace = "root/test") {
    return messageElement("<METHODCALL NAME=\"" + method + "\"><LOCALINSTANCEPATH>" +
                          nameSpaceElement(nameSpace) + instanceNameElement(id) +
                          "</LOCALINSTANCEPATH>" + parameters + "</METHODCALL>");
}

} // namespace qelo::server
