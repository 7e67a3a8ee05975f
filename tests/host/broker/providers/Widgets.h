// What the parts of the widget provider share: an instance, method, property and association
// provider that tries everything a provider may do.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <atomic>
#include <map>
#include <mutex>
#include <string>

namespace widgets {

// Every factory writes it, while other threads may be in operations already.
class BrokerPointer {
public:
    BrokerPointer& operator=(const CMPIBroker* mb) {
        mb_ = mb;
        return *this;
    }
    operator const CMPIBroker*() const { return mb_; }
    const CMPIBroker* operator->() const { return mb_; }

private:
    std::atomic<const CMPIBroker*> mb_{nullptr};
};
extern BrokerPointer broker;

struct Widget {
    std::string color;
    CMPIUint32 size = 0;
};

// The widgets by name. Hold the mutex.
extern std::mutex mutex;
extern std::map<std::string, Widget> store;

inline std::string textOf(const CMPIString* string) { return string ? CMGetCharPtr(string) : ""; }

// The text of a value, or "" for anything but a string.
inline std::string textOf(const CMPIData& data) {
    return data.type == CMPI_string && !CMIsNullValue(data) ? textOf(data.value.string) : "";
}

CMPIObjectPath* makePath(const std::string& nameSpace, const std::string& className,
                         const std::string& name);
CMPIInstance* makeInstance(const std::string& nameSpace, const std::string& className,
                           const std::string& name, const Widget& widget, const char** properties);

CMPIStatus statusOf(CMPIrc rc, const char* message);

// The methods that use threads.
CMPIStatus enumerateInThread(const CMPIContext* ctx, const CMPIResult* rslt,
                             const CMPIObjectPath* op);

} // namespace widgets
