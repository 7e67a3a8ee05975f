#include "support/broker/Call.h"

#include "support/broker/Convert.h"

namespace qelo::test {

namespace {

std::string describeObject(const Object& object) {
    if (object.kind == Kind::ObjectPath) {
        const Path& path = *static_cast<const ObjectOf<CMPIObjectPath>&>(object).content;
        return path.nameSpace + ':' + path.className;
    }
    if (object.kind == Kind::String) {
        return '"' + *static_cast<const ObjectOf<CMPIString>&>(object).content + '"';
    }
    return {};
}

} // namespace

Call::Call(const char* slot, const void* self, Kind kind, CMPIStatus* st)
    : lock_(BrokerState::mutex()), slot_(slot), st_(st) {
    // A call without a usable object is put down to the broker that most likely made it.
    Object* const known = BrokerState::objectAt(self);
    state_ = known != nullptr ? known->owner : &BrokerState::youngest();
    self_ = check(self, kind, "object");
}

Call::~Call() {
    if (st_ != nullptr) {
        write(rc_, message_);
    }
}

Object* Call::check(const void* object, Kind kind, const char* role) {
    const std::string what = std::string(kindName(kind)) + " as " + role;
    Object* const known = BrokerState::objectAt(object);
    if (object == nullptr) {
        refuse(CMPI_RC_ERR_INVALID_HANDLE, "NULL " + what);
    } else if (known == nullptr) {
        refuse(CMPI_RC_ERR_INVALID_HANDLE, "unknown " + what);
    } else if (known->kind != kind) {
        refuse(CMPI_RC_ERR_INVALID_HANDLE, std::string(kindName(known->kind)) + " for " + what);
    } else if (known->life == Life::Ended) {
        refuse(CMPI_RC_ERR_INVALID_HANDLE, what + " used after its end");
    } else if (!known->hasHandle()) {
        refuse(CMPI_RC_ERR_INVALID_HANDLE, what + " without a handle");
    } else {
        return known;
    }
    return nullptr;
}

void Call::argument(const std::string& text) {
    if (hasArguments_) {
        arguments_ += ',';
    }
    arguments_ += text;
    hasArguments_ = true;
}

void Call::text(const char* text) {
    if (text == nullptr) {
        refuse(CMPI_RC_ERR_INVALID_PARAMETER, "NULL text");
    }
    optional(text);
}

void Call::quoted(const char* text) {
    if (text == nullptr) {
        refuse(CMPI_RC_ERR_INVALID_PARAMETER, "NULL text");
    }
    argument(text == nullptr ? "null" : '"' + std::string(text) + '"');
}

void Call::optional(const char* text) { argument(text == nullptr ? "null" : text); }

void Call::list(const char** names) {
    if (names == nullptr) {
        argument("null");
        return;
    }
    std::string text;
    for (; *names != nullptr; ++names) {
        text += (text.empty() ? "" : ",") + std::string(*names);
    }
    argument('{' + text + '}');
}

void Call::number(unsigned long long number) { argument(std::to_string(number)); }

void Call::elementType(CMPIType type) {
    argument(typeName(type));
    if (!isKnownType(type) || (type & CMPI_ARRAY) != 0) {
        refuse(CMPI_RC_ERR_INVALID_DATA_TYPE, "unknown type " + typeName(type));
    }
}

void Call::object(const void* object, Kind kind) {
    const Object* const known = check(object, kind, "argument");
    const std::string text = known == nullptr ? "invalid" : describeObject(*known);
    if (!text.empty()) {
        argument(text);
    }
}

Value Call::value(const CMPIValue* value, CMPIType type) {
    Value result = fromCmpi(*this, value, type);
    argument(result.describe());
    return result;
}

bool Call::begin() {
    const std::optional<Fault> fault = state_->record(slot_, arguments_);
    if (fault) {
        meet(*fault);
    }
    return !faulted_ && rc_ == CMPI_RC_OK;
}

void Call::meet(const Fault& fault) {
    faulted_ = true;
    rc_ = fault.kind == Fault::Kind::Error ? fault.rc : CMPI_RC_OK;
    message_ = fault.message;
    nullHandleWanted_ = fault.kind == Fault::Kind::NullHandle;
}

void Call::violate(const std::string& text) { state_->violate(std::string(slot_) + ": " + text); }

void Call::fail(CMPIrc rc, const std::string& message) {
    rc_ = rc;
    message_ = message;
}

void Call::refuse(CMPIrc rc, const std::string& text) {
    violate(text);
    if (rc_ == CMPI_RC_OK) {
        fail(rc);
    }
}

CMPIStatus Call::status() {
    CMPIStatus result = {rc_, nullptr};
    if (faulted_ && rc_ == CMPI_RC_OK) {
        result.rc = CMPI_RC_ERR_FAILED;
    }
    if (!message_.empty()) {
        result.msg = string(message_);
    }
    return result;
}

void Call::write(CMPIrc rc, const std::string& message) {
    st_->rc = rc;
    st_->msg = message.empty() ? nullptr : string(message);
}

CMPIData Call::noData(CMPIType type) {
    if (nullHandleWanted_) {
        return data(Value::withoutHandle(type));
    }
    CMPIData result = {type, CMPI_nullValue | CMPI_notFound, {0}};
    return result;
}

CMPIData Call::noDataAndName(CMPIString** name) {
    if (name != nullptr) {
        *name = noObject<CMPIString>();
    }
    return noData();
}

CMPIData Call::data(const Value& value, CMPIValueState extraState) {
    CMPIData result = toCmpi(*state_, value);
    result.state = static_cast<CMPIValueState>(result.state | extraState);
    return result;
}

CMPIData Call::named(const std::vector<NamedValue>& values, const char* name,
                     CMPIValueState extraState) {
    const Value* const found = find(values, name);
    if (found != nullptr) {
        return data(*found, extraState);
    }
    fail(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return noData();
}

CMPIData Call::at(const std::vector<NamedValue>& values, CMPICount index, CMPIString** name,
                  CMPIValueState extraState) {
    if (index >= values.size()) {
        refuse(CMPI_RC_ERR_NO_SUCH_PROPERTY, "position out of range");
        return noDataAndName(name);
    }
    if (name != nullptr) {
        *name = string(values[index].name);
    }
    return data(values[index].value, extraState);
}

} // namespace qelo::test
