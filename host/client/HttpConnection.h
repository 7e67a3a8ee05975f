// A Connection to a CIM server somewhere else: CIM-XML over HTTP or HTTPS (DMTF DSP0200).
#pragma once

#include "Connection.h"
#include "HttpTransport.h"

#include <cimxml/Request.h>
#include <cimxml/ResponseReader.h>

#include <cstdint>
#include <string>

namespace qelo::client {

// Operations go through one connection, one at a time: use an object from one thread only.
// Results are handed on while the answer still arrives; paths among them have no host and
// carry the namespace of the request where the answer names none, as those of providers in
// this process do.
// Beside CimError every operation throws Unreachable. CimError 1 is also what a broken
// connection, a time-out or an answer that makes no sense becomes.
class HttpConnection final : public Connection {
public:
    explicit HttpConnection(HttpOptions options) : transport_(std::move(options)) {}

    void enumerateInstanceNames(const cim::ObjectPath& classPath, const PathSink& sink) override;
    void enumerateInstances(const cim::ObjectPath& classPath, const PropertyList& properties,
                            const InstanceSink& sink) override;
    cim::Instance getInstance(const cim::ObjectPath& path, const PropertyList& properties) override;
    void associators(const cim::ObjectPath& path, const AssociationFilter& filter,
                     const PropertyList& properties, const InstanceSink& sink) override;
    void associatorNames(const cim::ObjectPath& path, const AssociationFilter& filter,
                         const PathSink& sink) override;
    void references(const cim::ObjectPath& path, const AssociationFilter& filter,
                    const PropertyList& properties, const InstanceSink& sink) override;
    void referenceNames(const cim::ObjectPath& path, const AssociationFilter& filter,
                        const PathSink& sink) override;
    MethodResult invokeMethod(const cim::ObjectPath& path, const std::string& method,
                              const Arguments& in) override;
    cim::Class getClass(const cim::ObjectPath& classPath) override;
    void enumerateClassNames(const cim::ObjectPath& classPath, bool deep,
                             const NameSink& sink) override;

private:
    class Call;

    void paths(Call call, const PathSink& sink);
    void instances(Call call, const InstanceSink& sink);
    MethodResult send(cimxml::Request request, cimxml::ResponseSinks sinks);

    HttpTransport transport_;
    std::uint64_t lastMessage_ = 0;
};

} // namespace qelo::client
