// Assembling CIM instances from records: which properties a request wants, and setting each
// with its CMPI type.
#pragma once

#include "BrokerAccess.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// The properties that a request asks for. Names are compared exactly.
class PropertyFilter {
public:
    // What a null list stands for.
    enum class NullList { Everything, Nothing };

    // `properties` is a null-terminated list of names, or null.
    PropertyFilter(const char** properties, NullList nullList);

    bool wants(const char* name) const;

private:
    bool everything_;
    std::vector<std::string_view> names_;
};

// A new instance of `className` placed like newPath; null when the path or the instance
// cannot be made. `lookup` (may be null) receives the status of the namespace look-ups.
CMPIInstance* newInstance(const CMPIBroker* broker, const CMPIObjectPath* ref,
                          const char* className, CMPIStatus* lookup);

// The localised caption that several classes share.
std::string localisedCaption();

// Sets the properties of one instance. Where the broker cannot make a value (an array, a
// string in it), the property is left unset.
class InstanceWriter {
public:
    // `status` (may be null) is the caller's, for properties that report to it.
    InstanceWriter(const CMPIBroker* broker, CMPIInstance* instance, CMPIStatus* status)
        : broker_(broker), instance_(instance), status_(status) {}

    const CMPIBroker* broker() const { return broker_; }
    CMPIStatus* status() const { return status_; }

    void chars(const char* name, const std::string& text) const;
    void boolean(const char* name, bool value) const;
    void uint16(const char* name, std::uint16_t value) const;
    void uint32(const char* name, std::uint32_t value) const;

    // A date from its CIM text; a null value where the broker refuses the text.
    void dateTime(const char* name, const std::string& text) const;

    // An array of strings.
    void strings(const char* name, const std::vector<std::string>& texts) const;

    // An array of numbers; false, with nothing set, when the broker makes no array. `created`
    // (may be null) receives the broker's status for the array.
    bool uint16Array(const char* name, const std::vector<std::uint16_t>& values,
                     CMPIStatus* created) const;

private:
    void set(const char* name, const CMPIValue& value, CMPIType type) const;
    CMPIArray* newArray(std::size_t size, CMPIType type, CMPIStatus* status) const;

    const CMPIBroker* broker_;
    CMPIInstance* instance_;
    CMPIStatus* status_;
};

// One optional property of a class: its name, and how it is set from a record. The factory
// that assembles the instance is at hand for conversions of its own.
template <class Record, class Factory> struct PropertyRow {
    const char* name;
    void (*set)(const InstanceWriter& writer, const char* name, Record& record, Factory& factory);
};

// The ordinary ways to set a property: from what a getter of the record returns.
namespace property {

template <auto getter, class Record, class Factory>
void chars(const InstanceWriter& writer, const char* name, Record& record, Factory&) {
    writer.chars(name, (record.*getter)());
}

template <auto getter, class Record, class Factory>
void boolean(const InstanceWriter& writer, const char* name, Record& record, Factory&) {
    writer.boolean(name, (record.*getter)());
}

// A wider number keeps its lower 16 bits.
template <auto getter, class Record, class Factory>
void uint16(const InstanceWriter& writer, const char* name, Record& record, Factory&) {
    writer.uint16(name, static_cast<std::uint16_t>((record.*getter)()));
}

template <auto getter, class Record, class Factory>
void uint32(const InstanceWriter& writer, const char* name, Record& record, Factory&) {
    writer.uint32(name, (record.*getter)());
}

// The localised caption, which no record holds.
template <class Record, class Factory>
void caption(const InstanceWriter& writer, const char* name, Record&, Factory&) {
    writer.chars(name, localisedCaption());
}

} // namespace property

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
