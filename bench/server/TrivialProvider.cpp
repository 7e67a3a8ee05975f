// A provider that costs next to nothing: accounts of 28 properties that are always the same.
// How many there are, the name of the class tells: BENCH_Account1000. Instances of such a
// class are one, made for the call and returned so many times; those of BENCH_FreshAccount1000
// are each made anew and given back once they are returned.
#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

#include <cstdlib>
#include <cstring>
#include <string_view>

namespace {

const CMPIBroker* broker = nullptr;

enum class Kind { Text, Date, NoDate, Texts, NoNumbers, Number16, Number32, Flag };

struct Property {
    const char* name;
    const char* text;
    Kind kind;
    unsigned int number;
};

// In the order and with the values that the accounts of a node file have.
constexpr Property properties[] = {
    {"SystemCreationClassName", "ZANTH_ComputerSystem", Kind::Text, 0},
    {"SystemName", "host", Kind::Text, 0},
    {"CreationClassName", "ZANTH_Account", Kind::Text, 0},
    {"Name", "user100000", Kind::Text, 0},
    {"Caption", "Simple Identity Management", Kind::Text, 0},
    {"Description", "Person 0", Kind::Text, 0},
    {"FullName", "", Kind::Text, 0},
    {"GroupId", nullptr, Kind::Number32, 100},
    {"daysMustChangePasswordAfter", nullptr, Kind::Number32, 99999},
    {"daysExpireAfter", nullptr, Kind::Number32, 0},
    {"UserID", "1000", Kind::Text, 0},
    {"UserPassword", "", Kind::Texts, 0},
    {"OrganizationName", "", Kind::Texts, 0},
    {"ElementName", "user100000", Kind::Text, 0},
    {"RequestedState", nullptr, Kind::Number16, 2},
    {"EnabledState", nullptr, Kind::Number16, 2},
    {"InactivityTimeout", nullptr, Kind::NoDate, 0},
    {"MaximumSuccessiveLoginFailures", nullptr, Kind::Number16, 0},
    {"PasswordExpiration", nullptr, Kind::NoDate, 0},
    {"PasswordHistoryDepth", nullptr, Kind::Number16, 0},
    {"ComplexPasswordRulesEnforced", nullptr, Kind::NoNumbers, 0},
    {"HomeDirectory", "/home/user100000", Kind::Text, 0},
    {"ScriptPath", "/bin/bash", Kind::Text, 0},
    {"passwordLastChanged", "20231209000000.000000+000", Kind::Date, 0},
    {"daysMustKeepPassword", nullptr, Kind::Number32, 0},
    {"daysWarnBeforePasswordExpire", nullptr, Kind::Number32, 7},
    {"passwordExpirationDate", nullptr, Kind::NoDate, 0},
    {"AccountDisable", nullptr, Kind::Flag, 0},
};

CMPIArray* oneText(const char* text) {
    CMPIArray* array = CMNewArray(broker, 1, CMPI_string, nullptr);
    CMPIValue value = {0};
    value.string = CMNewString(broker, text, nullptr);
    CMSetArrayElementAt(array, 0, &value, CMPI_string);
    return array;
}

void set(CMPIInstance* instance, const Property& property) {
    CMPIValue value = {0};
    switch (property.kind) {
    case Kind::Text:
        CMSetProperty(instance, property.name, property.text, CMPI_chars);
        return;
    case Kind::Date:
        value.dateTime = CMNewDateTimeFromChars(broker, property.text, nullptr);
        CMSetProperty(instance, property.name, &value, CMPI_dateTime);
        return;
    case Kind::NoDate:
        CMSetProperty(instance, property.name, nullptr, CMPI_dateTime);
        return;
    case Kind::Texts:
        value.array = oneText(property.text);
        CMSetProperty(instance, property.name, &value, CMPI_stringA);
        return;
    case Kind::NoNumbers:
        value.array = CMNewArray(broker, 0, CMPI_uint16, nullptr);
        CMSetProperty(instance, property.name, &value, CMPI_uint16A);
        return;
    case Kind::Number16:
        value.uint16 = static_cast<CMPIUint16>(property.number);
        CMSetProperty(instance, property.name, &value, CMPI_uint16);
        return;
    case Kind::Number32:
        value.uint32 = property.number;
        CMSetProperty(instance, property.name, &value, CMPI_uint32);
        return;
    case Kind::Flag:
        value.boolean = static_cast<CMPIBoolean>(property.number);
        CMSetProperty(instance, property.name, &value, CMPI_boolean);
        return;
    }
}

const char* classOf(const CMPIObjectPath* ref) {
    return CMGetCharPtr(CMGetClassName(ref, nullptr));
}

CMPIInstance* make(const CMPIObjectPath* ref) {
    const char* nameSpace = CMGetCharPtr(CMGetNameSpace(ref, nullptr));
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, classOf(ref), nullptr);
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    for (const Property& property : properties) {
        set(instance, property);
    }
    return instance;
}

unsigned long countOf(std::string_view className) {
    const std::size_t digits = className.find_first_of("0123456789");
    return digits == std::string_view::npos ? 0
                                            : std::strtoul(className.data() + digits, nullptr, 10);
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus enumInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                         const CMPIObjectPath* ref, const char**) {
    const unsigned long count = countOf(classOf(ref));
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    if (std::strstr(classOf(ref), "Fresh") == nullptr) {
        const CMPIInstance* instance = make(ref);
        for (unsigned long i = 0; i < count && status.rc == CMPI_RC_OK; ++i) {
            status = CMReturnInstance(result, instance);
        }
    } else {
        for (unsigned long i = 0; i < count && status.rc == CMPI_RC_OK; ++i) {
            const CMPIGcStat* level = broker->mft->mark(broker, nullptr);
            status = CMReturnInstance(result, make(ref));
            broker->mft->release(broker, level);
        }
    }
    if (status.rc == CMPI_RC_OK) {
        CMReturnDone(result);
    }
    return status;
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* ref, const char**) {
    CMReturnInstance(result, make(ref));
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

} // namespace

extern "C" __attribute__((visibility("default"))) CMPIInstanceMI*
TrivialProvider_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*, CMPIStatus*) {
    static CMPIInstanceMIFT table = {};
    table.ftVersion = CMPIVersion200;
    table.miVersion = CMPIVersion200;
    table.miName = "instanceTrivialProvider";
    table.cleanup = cleanup;
    table.enumerateInstances = enumInstances;
    table.getInstance = getInstance;
    static CMPIInstanceMI mi = {nullptr, &table};
    broker = mb;
    return &mi;
}
