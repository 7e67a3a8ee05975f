// The class reference for people, docs/classes.md: what the schema declares and the providers
// serve, as Markdown. It is made from the two, so it cannot say anything else.
#pragma once

#include <broker/Registration.h>
#include <schema/ClassRepository.h>

#include <string>
#include <vector>

namespace qelo::reference {

// A class with its provider.
struct ServedClass {
    broker::ProviderRegistration registration;
    std::vector<std::string> properties; // that the provider gives its instances, keys included
};

// The reference of these classes, in their order. std::runtime_error when the repository does
// not have one of them in the first namespace of its registration.
std::string classReference(const schema::ClassRepository& repository,
                           const std::vector<ServedClass>& classes);

} // namespace qelo::reference
