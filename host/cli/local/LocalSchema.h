// What the object manager inside this process knows of classes and of their providers: the
// MOF and registration files of one or more folders.
#pragma once

#include "../Options.h"

#include <broker/Dispatcher.h>
#include <broker/RegistrationFile.h>
#include <schema/ClassRepository.h>

#include <memory>
#include <string>
#include <vector>

namespace qelo::cli {

// Where schema files are looked for: the folders of the options, or else "share/qelosim"
// beside the directory of the executable if it is there, or else where they are installed.
std::vector<std::string> schemaDirectories(const Options& options);

struct LocalSchema {
    std::shared_ptr<const schema::ClassRepository> classes;
    // One for each file; `name` is that of the file.
    struct Registrations {
        std::string name;
        broker::RegistrationFile file;
    };
    std::vector<Registrations> registrations;
};

// Reads all *.mof files that no others include, and all *.reg files, of those folders. Throws
// StoreError with one line that says which file is wrong, where and why.
LocalSchema readLocalSchema(const Options& options);

// Registers all providers. StoreError when two files claim the same class.
void registerProviders(const LocalSchema& schema, broker::Dispatcher& dispatcher);

} // namespace qelo::cli
