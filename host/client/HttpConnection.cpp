#include "HttpConnection.h"

#include <cimxml/RequestWriter.h>

#include <optional>
#include <utility>

namespace qelo::client {
namespace {

constexpr unsigned int kFailed = 1;

// A path in an answer, as a provider in this process would have returned it.
cim::ObjectPath atHome(cim::ObjectPath path, const std::string& nameSpace) {
    path.setHost("");
    if (path.nameSpace().empty()) {
        path.setNameSpace(nameSpace);
    }
    return path;
}

// How the path is spelled in the field CIMObject.
std::string objectOf(const cimxml::Request& request) {
    return request.extrinsic ? request.target.toText() : request.target.nameSpace();
}

template <class Result> Result only(std::optional<Result> result) {
    if (!result) {
        throw CimError(kFailed, "the answer holds no result");
    }
    return *std::move(result);
}

} // namespace

// An intrinsic method with its parameters, in the order of DSP0200.
class HttpConnection::Call {
public:
    Call(const char* method, const cim::ObjectPath& path) {
        request_.method = method;
        request_.target.setNameSpace(path.nameSpace());
    }

    Call& add(const char* name, decltype(cimxml::IntrinsicParameter::value) value) {
        request_.intrinsicParameters.push_back({name, std::move(value)});
        return *this;
    }
    Call& text(const char* name, const std::string& value) {
        return value.empty() ? *this : add(name, value);
    }
    Call& flag(const char* name, bool value) { return add(name, value ? "TRUE" : "FALSE"); }
    Call& className(const char* name, const std::string& value) {
        return value.empty() ? *this : add(name, cimxml::ClassName{value});
    }
    // The instance (or class) itself: its namespace stands elsewhere.
    Call& object(const char* name, cim::ObjectPath path) {
        if (path.keys().empty()) {
            return className(name, path.className());
        }
        path.setNameSpace("");
        path.setHost("");
        return add(name, std::move(path));
    }
    Call& properties(const PropertyList& names) {
        return names ? add("PropertyList", cimxml::TextList(names->begin(), names->end())) : *this;
    }

    cimxml::Request take() { return std::move(request_); }

private:
    cimxml::Request request_;
};

void HttpConnection::enumerateInstanceNames(const cim::ObjectPath& classPath,
                                            const PathSink& sink) {
    paths(Call("EnumerateInstanceNames", classPath).className("ClassName", classPath.className()),
          sink);
}

void HttpConnection::enumerateInstances(const cim::ObjectPath& classPath,
                                        const PropertyList& properties, const InstanceSink& sink) {
    instances(Call("EnumerateInstances", classPath)
                  .className("ClassName", classPath.className())
                  .flag("LocalOnly", false)
                  .flag("DeepInheritance", true)
                  .flag("IncludeQualifiers", false)
                  .flag("IncludeClassOrigin", false)
                  .properties(properties),
              sink);
}

cim::Instance HttpConnection::getInstance(const cim::ObjectPath& path,
                                          const PropertyList& properties) {
    std::optional<cim::Instance> result;
    cimxml::ResponseSinks sinks;
    sinks.instance = [&](cim::Instance instance) {
        cim::ObjectPath found = path;
        found.setClassName(instance.className());
        instance.setPath(atHome(std::move(found), path.nameSpace()));
        result = std::move(instance);
    };
    send(Call("GetInstance", path)
             .object("InstanceName", path)
             .flag("LocalOnly", false)
             .flag("IncludeQualifiers", false)
             .flag("IncludeClassOrigin", false)
             .properties(properties)
             .take(),
         std::move(sinks));
    return only(std::move(result));
}

void HttpConnection::associators(const cim::ObjectPath& path, const AssociationFilter& filter,
                                 const PropertyList& properties, const InstanceSink& sink) {
    instances(Call("Associators", path)
                  .object("ObjectName", path)
                  .className("AssocClass", filter.assocClass)
                  .className("ResultClass", filter.resultClass)
                  .text("Role", filter.role)
                  .text("ResultRole", filter.resultRole)
                  .flag("IncludeQualifiers", false)
                  .flag("IncludeClassOrigin", false)
                  .properties(properties),
              sink);
}

void HttpConnection::associatorNames(const cim::ObjectPath& path, const AssociationFilter& filter,
                                     const PathSink& sink) {
    paths(Call("AssociatorNames", path)
              .object("ObjectName", path)
              .className("AssocClass", filter.assocClass)
              .className("ResultClass", filter.resultClass)
              .text("Role", filter.role)
              .text("ResultRole", filter.resultRole),
          sink);
}

void HttpConnection::references(const cim::ObjectPath& path, const AssociationFilter& filter,
                                const PropertyList& properties, const InstanceSink& sink) {
    instances(Call("References", path)
                  .object("ObjectName", path)
                  .className("ResultClass", filter.resultClass)
                  .text("Role", filter.role)
                  .flag("IncludeQualifiers", false)
                  .flag("IncludeClassOrigin", false)
                  .properties(properties),
              sink);
}

void HttpConnection::referenceNames(const cim::ObjectPath& path, const AssociationFilter& filter,
                                    const PathSink& sink) {
    paths(Call("ReferenceNames", path)
              .object("ObjectName", path)
              .className("ResultClass", filter.resultClass)
              .text("Role", filter.role),
          sink);
}

MethodResult HttpConnection::invokeMethod(const cim::ObjectPath& path, const std::string& method,
                                          const Arguments& in) {
    cimxml::Request request;
    request.extrinsic = true;
    request.method = method;
    request.target = path;
    request.target.setHost("");
    for (const auto& [name, value] : in) {
        request.extrinsicParameters.push_back({name, value, true});
    }
    return send(std::move(request), {});
}

cim::Class HttpConnection::getClass(const cim::ObjectPath& classPath) {
    std::optional<cim::Class> result;
    cimxml::ResponseSinks sinks;
    sinks.declaration = [&](cim::Class declaration) { result = std::move(declaration); };
    send(Call("GetClass", classPath)
             .className("ClassName", classPath.className())
             .flag("LocalOnly", false)
             .flag("IncludeQualifiers", true)
             .flag("IncludeClassOrigin", true)
             .take(),
         std::move(sinks));
    return only(std::move(result));
}

void HttpConnection::enumerateClassNames(const cim::ObjectPath& classPath, bool deep,
                                         const NameSink& sink) {
    cimxml::ResponseSinks sinks;
    sinks.className = sink;
    send(Call("EnumerateClassNames", classPath)
             .className("ClassName", classPath.className())
             .flag("DeepInheritance", deep)
             .take(),
         std::move(sinks));
}

void HttpConnection::paths(Call call, const PathSink& sink) {
    cimxml::Request request = call.take();
    cimxml::ResponseSinks sinks;
    sinks.path = [&sink, nameSpace = request.target.nameSpace()](cim::ObjectPath path) {
        sink(atHome(std::move(path), nameSpace));
    };
    send(std::move(request), std::move(sinks));
}

void HttpConnection::instances(Call call, const InstanceSink& sink) {
    cimxml::Request request = call.take();
    cimxml::ResponseSinks sinks;
    sinks.instance = [&sink, nameSpace = request.target.nameSpace()](cim::Instance instance) {
        instance.setPath(atHome(instance.path(), nameSpace));
        sink(instance);
    };
    send(std::move(request), std::move(sinks));
}

MethodResult HttpConnection::send(cimxml::Request request, cimxml::ResponseSinks sinks) {
    if (request.target.nameSpace().empty()) {
        constexpr unsigned int invalidNamespace = 3;
        throw CimError(invalidNamespace, "no namespace is given");
    }
    request.messageId = std::to_string(++lastMessage_);
    HttpRequest message = {request.method, objectOf(request), {}, !request.extrinsic};
    cimxml::writeRequest(message.body, request);
    cimxml::ResponseReader reader(std::move(sinks));
    transport_.post(message, [&](std::string_view piece) { reader.feed(piece); });
    reader.finish();
    return reader.methodResult();
}

} // namespace qelo::client
