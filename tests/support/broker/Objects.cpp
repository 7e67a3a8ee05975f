#include "support/broker/Objects.h"

#include "support/broker/BrokerState.h"

#include <algorithm>
#include <strings.h>

namespace qelo::test {

const char* kindName(Kind kind) {
    switch (kind) {
    case Kind::Broker:
        return "CMPIBroker";
    case Kind::Context:
        return "CMPIContext";
    case Kind::Result:
        return "CMPIResult";
    case Kind::String:
        return "CMPIString";
    case Kind::Array:
        return "CMPIArray";
    case Kind::Enumeration:
        return "CMPIEnumeration";
    case Kind::Instance:
        return "CMPIInstance";
    case Kind::ObjectPath:
        return "CMPIObjectPath";
    case Kind::Args:
        return "CMPIArgs";
    case Kind::DateTime:
        return "CMPIDateTime";
    }
    return "";
}

bool InstanceContent::admits(const std::string& name) const {
    return !filtered || std::any_of(filter.begin(), filter.end(), [&](const std::string& listed) {
        return strcasecmp(listed.c_str(), name.c_str()) == 0;
    });
}

Instance InstanceContent::visible() const {
    Instance result;
    result.path = data.path;
    for (const NamedValue& entry : data.properties) {
        if (admits(entry.name)) {
            result.properties.push_back(entry);
        }
    }
    return result;
}

BrokerObject::BrokerObject(BrokerState& state) : Object(Kind::Broker, Life::Test, state) {
    cmpi.hdl = this;
    cmpi.bft = tableBroker();
    cmpi.eft = tableBrokerEnc();
    cmpi.xft = tableBrokerExt();
    cmpi.mft = nullptr;
}

void put(std::vector<NamedValue>& values, const std::string& name, const Value& value) {
    for (NamedValue& entry : values) {
        if (strcasecmp(entry.name.c_str(), name.c_str()) == 0) {
            entry.value = value;
            return;
        }
    }
    values.push_back({name, value});
}

const Value* find(const std::vector<NamedValue>& values, const std::string& name) {
    for (const NamedValue& entry : values) {
        if (strcasecmp(entry.name.c_str(), name.c_str()) == 0) {
            return &entry.value;
        }
    }
    return nullptr;
}

} // namespace qelo::test
