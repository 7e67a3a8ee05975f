// Prints the class reference: class_reference SCHEMA-FOLDER LIBRARY-FOLDER
#include "ServedClasses.h"

#include <cstdlib>
#include <exception>
#include <iostream>
#include <stdexcept>

namespace {

namespace fs = std::filesystem;

// A folder that goes with the program.
class ScratchFolder {
public:
    ScratchFolder() {
        std::string name = (fs::temp_directory_path() / "class_reference_XXXXXX").string();
        if (::mkdtemp(name.data()) == nullptr) {
            throw std::runtime_error("cannot make a folder in " +
                                     fs::temp_directory_path().string());
        }
        path_ = name;
    }
    ~ScratchFolder() {
        std::error_code ignored;
        fs::remove_all(path_, ignored);
    }
    ScratchFolder(const ScratchFolder&) = delete;
    ScratchFolder& operator=(const ScratchFolder&) = delete;

    const fs::path& path() const { return path_; }

private:
    fs::path path_;
};

} // namespace

int main(int count, char** arguments) {
    using namespace qelo::reference;
    if (count != 3) {
        std::cerr << "usage: class_reference SCHEMA-FOLDER LIBRARY-FOLDER\n";
        return EXIT_FAILURE;
    }
    try {
        const ScratchFolder scratch;
        const auto classes = askProviders(arguments[1], arguments[2], scratch.path());
        std::cout << classReference(readSchema(arguments[1]), classes) << std::flush;
        return std::cout ? EXIT_SUCCESS : EXIT_FAILURE;
    } catch (const std::exception& error) {
        std::cerr << "class_reference: " << error.what() << "\n";
        return EXIT_FAILURE;
    }
}
