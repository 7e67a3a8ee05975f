#include "Result.h"

#include "Convert.h"
#include "Data.h"
#include "Slot.h"

#include <cstring>

namespace qelo::broker {
namespace {

using Kind = ResultObject::Kind;

ResultObject& openResult(const CMPIResult* self) {
    ResultObject& result = alive<ResultObject>(self);
    if (result.sinkFailure) {
        throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
    }
    if (result.done) {
        throw Refusal{CMPI_RC_ERR_FAILED, "data after the end of the results"};
    }
    return result;
}

// What a sink throws is the client's affair: it waits here until the provider is done.
template <class Sink, class Item>
void deliver(ResultObject& result, const Sink& sink, const Item& item) {
    try {
        sink(item);
    } catch (...) {
        passForcedUnwind();
        result.sinkFailure = std::current_exception();
        throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
    }
}

void keepValue(ResultObject& result, cim::Value value) {
    if (result.value) {
        throw Refusal{CMPI_RC_ERR_FAILED, "a second return value"};
    }
    result.value = std::move(value);
}

void putInstance(ResultObject& result, const InstanceObject& instance) {
    cim::Instance& converted = result.converted;
    assign(converted, instance, result.properties);
    if (converted.path().nameSpace().empty()) {
        converted.mutablePath().setNameSpace(result.nameSpace);
    }
    if (result.kind == Kind::Instances) {
        deliver(result, result.instanceSink, converted);
    } else if (result.kind == Kind::Value) {
        keepValue(result, cim::Value::instance(std::move(converted)));
    } else {
        throw Refusal{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
}

void putPath(ResultObject& result, const ObjectPathObject& path) {
    cim::ObjectPath converted = toCim(path);
    if (converted.nameSpace().empty()) {
        converted.setNameSpace(result.nameSpace);
    }
    if (result.kind == Kind::Paths) {
        deliver(result, result.pathSink, converted);
    } else if (result.kind == Kind::Value) {
        keepValue(result, cim::Value::reference(std::move(converted)));
    } else {
        throw Refusal{CMPI_RC_ERR_INVALID_DATA_TYPE};
    }
}

CMPIStatus returnInstance(const CMPIResult* self, const CMPIInstance* instance) {
    return statusSlot([&] { putInstance(openResult(self), alive<InstanceObject>(instance)); });
}

CMPIStatus returnObjectPath(const CMPIResult* self, const CMPIObjectPath* path) {
    return statusSlot([&] { putPath(openResult(self), alive<ObjectPathObject>(path)); });
}

CMPIStatus returnData(const CMPIResult* self, const CMPIValue* value, CMPIType type) {
    return statusSlot([&] {
        ResultObject& result = openResult(self);
        if (result.kind == Kind::Value) {
            Arena scratch;
            keepValue(result, toCim(storeData(scratch, value, type)));
        } else if (value && (type == CMPI_instance || type == CMPI_ref)) {
            void* object = nullptr; // the value may be a bare pointer
            std::memcpy(&object, static_cast<const void*>(value), sizeof object);
            if (type == CMPI_instance) {
                putInstance(result, alive<InstanceObject>(static_cast<CMPIInstance*>(object)));
            } else {
                putPath(result, alive<ObjectPathObject>(static_cast<CMPIObjectPath*>(object)));
            }
        } else {
            throw Refusal{CMPI_RC_ERR_INVALID_DATA_TYPE};
        }
    });
}

// Providers call it twice at times, which does no harm.
CMPIStatus returnDone(const CMPIResult* self) {
    return statusSlot([&] {
        ResultObject& result = alive<ResultObject>(self);
        if (result.sinkFailure) {
            throw Refusal{CMPI_RC_ERR_INVALID_HANDLE};
        }
        result.done = true;
    });
}

CMPIStatus returnError(const CMPIResult* self, const CMPIError* source) {
    return statusSlot([&] {
        ResultObject& result = alive<ResultObject>(self);
        const ErrorObject& error = alive<ErrorObject>(source);
        if (result.error) {
            return; // one error is all that a client can be told
        }
        const std::string text = error.message ? std::string(error.message->view()) : "";
        result.error.emplace(static_cast<unsigned int>(error.statusCode), text);
    });
}

CMPIResult* clone(const CMPIResult* self, CMPIStatus* st) {
    return slot<CMPIResult*>(st, nullptr, [&]() -> CMPIResult* {
        (void)alive<ResultObject>(self);
        throw Refusal{CMPI_RC_ERR_NOT_SUPPORTED, "a result cannot be copied"};
    });
}

} // namespace

const CMPIResultFT ResultObject::table = {
    CMPIVersion200, releaseSlot<ResultObject>, clone,      returnData,
    returnInstance, returnObjectPath,          returnDone, returnError,
};

} // namespace qelo::broker
