// Methods and single properties.
#include "DispatcherImpl.h"

namespace qelo::broker {
namespace {

using Kind = ResultObject::Kind;

cim::Value valueOf(ResultObject& result) {
    return result.value ? std::move(*result.value) : cim::Value::null(cim::Type::UInt32);
}

} // namespace

// The method's name reaches the provider as the client spelled it.
client::MethodResult Dispatcher::invokeMethod(const OperationContext& context,
                                              const cim::ObjectPath& path,
                                              const std::string& method,
                                              const client::Arguments& in) {
    return asOperation([&] {
        const auto target =
            impl_->requireServer(path, ProviderType::Method, CMPI_RC_ERR_METHOD_NOT_AVAILABLE);
        CMPIMethodMI* mi = target.provider->methodMI(path.nameSpace());
        ProviderCall call(impl_->broker, context, Kind::Value);
        call.result().nameSpace = path.nameSpace();
        const auto* object = call.path(impl_->spelled(path));
        const ArgsObject* given = fromCim(call.arena(), in, Ownership::Contained);
        ArgsObject* filled = fromCim(call.arena(), client::Arguments(), Ownership::Contained);
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->invokeMethod;
            return slot ? slot(mi, call.context(), call.cmpiResult(), object, method.c_str(),
                               &given->cmpi, &filled->cmpi)
                        : noSuchSlot();
        });
        return client::MethodResult{valueOf(call.result()), toCim(*filled)};
    });
}

// Without a property provider, a property is changed and read through its instance.
void Dispatcher::setProperty(const OperationContext& context, const cim::ObjectPath& path,
                             const std::string& name, const cim::Value& value) {
    asOperation([&] {
        const auto target =
            impl_->registry.serverOf(path.nameSpace(), path.className(), ProviderType::Property);
        if (!target.provider) {
            cim::Instance change(path);
            change.setProperty(name, value);
            modifyInstance(context, path, change, client::PropertyList({name}));
            return;
        }
        CMPIPropertyMI* mi = target.provider->propertyMI(path.nameSpace());
        ProviderCall call(impl_->broker, context, Kind::Nothing);
        const auto* object = call.path(impl_->spelled(path));
        const CMPIData data = fromCim(call.arena(), value);
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->setProperty;
            return slot ? slot(mi, call.context(), call.cmpiResult(), object, name.c_str(), data)
                        : noSuchSlot();
        });
    });
}

cim::Value Dispatcher::getProperty(const OperationContext& context, const cim::ObjectPath& path,
                                   const std::string& name) {
    return asOperation([&] {
        const auto target =
            impl_->registry.serverOf(path.nameSpace(), path.className(), ProviderType::Property);
        if (!target.provider) {
            const cim::Instance found = getInstance(context, path, client::PropertyList({name}));
            if (const cim::Value* value = found.property(name)) {
                return *value;
            }
            throw client::CimError(CMPI_RC_ERR_NO_SUCH_PROPERTY, "no such property: " + name);
        }
        CMPIPropertyMI* mi = target.provider->propertyMI(path.nameSpace());
        ProviderCall call(impl_->broker, context, Kind::Value);
        call.result().nameSpace = path.nameSpace();
        const auto* object = call.path(impl_->spelled(path));
        call.run(target.provider->name(), [&] {
            const auto slot = mi->ft->getProperty;
            return slot ? slot(mi, call.context(), call.cmpiResult(), object, name.c_str())
                        : noSuchSlot();
        });
        if (!call.result().value) {
            throw client::CimError(CMPI_RC_ERR_NO_SUCH_PROPERTY, "no such property: " + name);
        }
        return valueOf(call.result());
    });
}

} // namespace qelo::broker
