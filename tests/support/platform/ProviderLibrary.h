// The provider library as an object manager sees it: opened once per process, its factory
// functions found by name.
#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

#include <string>

namespace qelo::test {

class ProviderLibrary {
public:
    // Opens the library at first use and keeps it open. Throws std::runtime_error with the
    // loader's message when it cannot be opened.
    static const ProviderLibrary& instance();

    // The file that was opened.
    static std::string path();

    // The address of an exported function. Throws std::runtime_error when there is none.
    void* function(const std::string& name) const;

    // Call <provider>_Create_<Type>MI with this broker. The result belongs to the library.
    CMPIInstanceMI* instanceMI(const std::string& provider, const CMPIBroker* broker) const;
    CMPIMethodMI* methodMI(const std::string& provider, const CMPIBroker* broker) const;
    CMPIAssociationMI* associationMI(const std::string& provider, const CMPIBroker* broker) const;

private:
    ProviderLibrary();
    void* handle_;
};

} // namespace qelo::test
