#include "FloorProvider.h"

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

#include <string>

namespace qelo::bench {
namespace {

// A property as the calls of the broker take it.
struct ReadyProperty {
    std::string name;
    CMPIType type = CMPI_null;
    bool isNull = false;
    std::string text;       // of a text or a date
    CMPIValue number = {0}; // of a number or a flag
    std::vector<std::string> texts;
    std::vector<CMPIUint16> numbers;
};

struct ReadyInstance {
    std::string className;
    std::vector<ReadyProperty> properties; // the keys first
};

std::vector<ReadyInstance> ready;
std::vector<std::string> keyNames;
std::string host;
const CMPIBroker* broker = nullptr;

void takeArray(ReadyProperty& made, const cim::Value& value) {
    for (const cim::Value& element : value.asArray()) {
        if (value.type() == cim::Type::String) {
            made.texts.push_back(element.asString());
        } else {
            made.numbers.push_back(static_cast<CMPIUint16>(element.asUnsigned()));
        }
    }
    made.type = value.type() == cim::Type::String ? CMPI_stringA : CMPI_uint16A;
}

void takeScalar(ReadyProperty& made, const cim::Value& value) {
    switch (value.type()) {
    case cim::Type::Boolean:
        made.type = CMPI_boolean;
        made.number.boolean = value.asBoolean();
        return;
    case cim::Type::UInt16:
        made.type = CMPI_uint16;
        made.number.uint16 = static_cast<CMPIUint16>(value.asUnsigned());
        return;
    case cim::Type::UInt32:
        made.type = CMPI_uint32;
        made.number.uint32 = static_cast<CMPIUint32>(value.asUnsigned());
        return;
    case cim::Type::DateTime:
        made.type = CMPI_dateTime;
        made.isNull = value.isNull();
        made.text = value.isNull() ? "" : value.asDateTime().text();
        return;
    default:
        made.type = CMPI_chars;
        made.text = value.asString();
        return;
    }
}

ReadyProperty readyProperty(const cim::Instance::Property& property) {
    ReadyProperty made;
    made.name = property.name;
    if (property.value.isArray()) {
        takeArray(made, property.value);
    } else {
        takeScalar(made, property.value);
    }
    return made;
}

CMPIArray* arrayOf(const ReadyProperty& property) {
    const bool texts = property.type == CMPI_stringA;
    const std::size_t size = texts ? property.texts.size() : property.numbers.size();
    const CMPIType type = texts ? CMPI_string : CMPI_uint16;
    CMPIArray* array = CMNewArray(broker, static_cast<CMPICount>(size), type, nullptr);
    for (std::size_t i = 0; i < size; ++i) {
        CMPIValue value = {0};
        if (texts) {
            value.string = CMNewString(broker, property.texts[i].c_str(), nullptr);
        } else {
            value.uint16 = property.numbers[i];
        }
        CMSetArrayElementAt(array, static_cast<CMPICount>(i), &value, type);
    }
    return array;
}

void set(CMPIInstance* instance, const ReadyProperty& property) {
    const char* name = property.name.c_str();
    CMPIValue value = property.number;
    switch (property.type) {
    case CMPI_chars:
        CMSetProperty(instance, name, property.text.c_str(), CMPI_chars);
        return;
    case CMPI_dateTime:
        if (property.isNull) {
            CMSetProperty(instance, name, nullptr, CMPI_dateTime);
            return;
        }
        value.dateTime = CMNewDateTimeFromChars(broker, property.text.c_str(), nullptr);
        break;
    case CMPI_stringA:
    case CMPI_uint16A:
        value.array = arrayOf(property);
        break;
    default:
        break;
    }
    CMSetProperty(instance, name, &value, property.type);
}

CMPIInstance* make(const CMPIObjectPath* ref, const ReadyInstance& source) {
    const char* nameSpace = CMGetCharPtr(CMGetNameSpace(ref, nullptr));
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, source.className.c_str(), nullptr);
    CMSetNameSpace(path, nameSpace);
    CMSetHostname(path, host.c_str());
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    std::vector<const char*> keys;
    keys.reserve(keyNames.size() + 1);
    for (const std::string& name : keyNames) {
        keys.push_back(name.c_str());
    }
    keys.push_back(nullptr);
    CMSetPropertyFilter(instance, nullptr, keys.data());
    for (const ReadyProperty& property : source.properties) {
        set(instance, property);
    }
    return instance;
}

// All instances are made before the first is returned, as the provider does.
CMPIStatus enumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                         const CMPIObjectPath* ref, const char**) {
    std::vector<CMPIInstance*> made;
    made.reserve(ready.size());
    for (const ReadyInstance& source : ready) {
        made.push_back(make(ref, source));
    }
    for (CMPIInstance* instance : made) {
        CMReturnInstance(result, instance);
    }
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

// Keys are texts. As above: made first, returned then.
CMPIStatus enumNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* ref) {
    const char* nameSpace = CMGetCharPtr(CMGetNameSpace(ref, nullptr));
    std::vector<CMPIObjectPath*> made;
    made.reserve(ready.size());
    for (const ReadyInstance& source : ready) {
        CMPIObjectPath* path =
            CMNewObjectPath(broker, nameSpace, source.className.c_str(), nullptr);
        CMSetHostname(path, host.c_str());
        for (std::size_t i = 0; i < keyNames.size(); ++i) {
            CMAddKey(path, keyNames[i].c_str(), source.properties[i].text.c_str(), CMPI_chars);
        }
        made.push_back(path);
    }
    for (CMPIObjectPath* path : made) {
        CMReturnObjectPath(result, path);
    }
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

// Does nothing but refuse, as a store does that does not know the command.
CMPIStatus refuseMethod(CMPIMethodMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                        const char*, const CMPIArgs*, CMPIArgs*) {
    return {CMPI_RC_ERR_FAILED, CMNewString(broker, "the method is unknown", nullptr)};
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus cleanupMethod(CMPIMethodMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

} // namespace

void setFloorInstances(const std::vector<cim::Instance>& instances) {
    ready.clear();
    keyNames.clear();
    if (!instances.empty()) {
        host = instances.front().path().host();
        for (const cim::ObjectPath::Key& key : instances.front().path().keys()) {
            keyNames.push_back(key.name);
        }
    }
    ready.reserve(instances.size());
    for (const cim::Instance& instance : instances) {
        ReadyInstance made{instance.className(), {}};
        made.properties.reserve(instance.properties().size());
        for (const cim::Instance::Property& property : instance.properties()) {
            made.properties.push_back(readyProperty(property));
        }
        ready.push_back(std::move(made));
    }
}

} // namespace qelo::bench

extern "C" __attribute__((visibility("default"))) CMPIInstanceMI*
FloorProvider_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMIFT table = {};
    table.ftVersion = CMPIVersion200;
    table.miVersion = CMPIVersion200;
    table.miName = "instanceFloorProvider";
    table.cleanup = qelo::bench::cleanup;
    table.enumerateInstances = qelo::bench::enumInstances;
    table.enumerateInstanceNames = qelo::bench::enumNames;
    static CMPIInstanceMI mi = {nullptr, &table};
    qelo::bench::broker = mb;
    return &mi;
}

extern "C" __attribute__((visibility("default"))) CMPIMethodMI*
FloorProvider_Create_MethodMI(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*) {
    static CMPIMethodMIFT table = {};
    table.ftVersion = CMPIVersion200;
    table.miVersion = CMPIVersion200;
    table.miName = "methodFloorProvider";
    table.cleanup = qelo::bench::cleanupMethod;
    table.invokeMethod = qelo::bench::refuseMethod;
    static CMPIMethodMI mi = {nullptr, &table};
    qelo::bench::broker = mb;
    return &mi;
}
