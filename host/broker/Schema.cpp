#include "Schema.h"

#include <utility>

namespace qelo::broker {
namespace {

std::vector<const cim::Instance*> instancesBelow(const schema::ClassRepository& repository,
                                                 const std::string& nameSpace,
                                                 const std::string& className) {
    std::vector<const cim::Instance*> all = repository.instances(nameSpace, className);
    for (const cim::Class* known : repository.subclasses(nameSpace, className, true)) {
        for (const cim::Instance* instance : repository.instances(nameSpace, known->name)) {
            all.push_back(instance);
        }
    }
    return all;
}

} // namespace

SchemaHooks schemaHooks(std::shared_ptr<const schema::ClassRepository> repository) {
    SchemaHooks hooks;
    hooks.isA = [repository](const std::string& nameSpace, const std::string& sub,
                             const std::string& super) {
        return repository->isA(nameSpace, sub, super);
    };
    hooks.hasNameSpace = [repository](const std::string& nameSpace) {
        return repository->hasNameSpace(nameSpace);
    };
    hooks.hasClass = [repository](const std::string& nameSpace, const std::string& className) {
        return repository->find(nameSpace, className) != nullptr;
    };
    hooks.findClass = [repository](const std::string& nameSpace, const std::string& className) {
        return repository->find(nameSpace, className);
    };
    hooks.instances = [repository = std::move(repository)](const std::string& nameSpace,
                                                           const std::string& className) {
        return instancesBelow(*repository, nameSpace, className);
    };
    return hooks;
}

} // namespace qelo::broker
