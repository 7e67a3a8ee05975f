// MOF text from anywhere: it is read or refused with SchemaError, and what was read can be
// asked for.
#include <schema/Mof.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

namespace {

using qelo::schema::ClassRepository;

void require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

// Every class stands behind its superclass, is found by its name, and has what it inherits.
void checkClasses(const ClassRepository& repository, const std::string& nameSpace) {
    for (const qelo::cim::Class* known : repository.subclasses(nameSpace, "", true)) {
        require(repository.find(nameSpace, known->name) == known);
        require(repository.isA(nameSpace, known->name, known->name));
        if (known->superclass.empty()) {
            continue;
        }
        const qelo::cim::Class* above = repository.find(nameSpace, known->superclass);
        require(above != nullptr && repository.isA(nameSpace, known->name, above->name));
        for (const auto& property : above->properties) {
            const auto* own = known->property(property.name);
            require(own != nullptr && own->type == property.type && own->array == property.array);
        }
        require(known->methods.size() >= above->methods.size());
    }
}

void checkInstances(const ClassRepository& repository, const std::string& nameSpace) {
    for (const qelo::cim::Class* known : repository.subclasses(nameSpace, "", true)) {
        for (const qelo::cim::Instance* instance : repository.instances(nameSpace, known->name)) {
            require(instance->path().keys().size() == repository.keyNames(*known).size());
        }
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    ClassRepository repository;
    // The text may include itself: that has to come to an end too.
    const qelo::schema::IncludeResolver include = [&](const std::string&,
                                                      const std::string& target) {
        return qelo::schema::MofSource{target, text};
    };
    try {
        qelo::schema::readMof({"fuzz.mof", text}, "root/fuzz", include, repository);
    } catch (const qelo::schema::SchemaError& error) {
        require(*error.what() != '\0');
    }
    for (const std::string& nameSpace : repository.nameSpaces()) {
        checkClasses(repository, nameSpace);
        checkInstances(repository, nameSpace);
    }
    return 0;
}
