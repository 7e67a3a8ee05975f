// A provider library in this process.
#pragma once

#include <stdexcept>
#include <string>
#include <vector>

namespace qelo::broker {

// Why a library or a symbol cannot be had, for people.
class LibraryError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// The file that a registration's library name stands for: an absolute path as it is; any other
// name X as libX.so or libX.so.1 in the first of the directories that has one. Throws
// LibraryError for a name with "/" or ".." that is not absolute, and when there is no file.
std::string findLibrary(const std::string& name, const std::vector<std::string>& directories);

class SharedLibrary {
public:
    // Loads the file with all its symbols resolved and none offered to other libraries.
    // Throws LibraryError with the loader's own text.
    explicit SharedLibrary(const std::string& path);
    // Unloads it, unless keepLoaded() was called.
    ~SharedLibrary();
    SharedLibrary(const SharedLibrary&) = delete;
    SharedLibrary& operator=(const SharedLibrary&) = delete;

    const std::string& path() const { return path_; }
    void keepLoaded() { keep_ = true; }

    // The function of that name, or null.
    template <class Function> Function* function(const std::string& name) const {
        return reinterpret_cast<Function*>(symbol(name));
    }

private:
    void* symbol(const std::string& name) const;

    std::string path_;
    void* handle_;
    bool keep_ = false;
};

} // namespace qelo::broker
