// The server's file of users: taken, or refused with the line that is wrong. Passwords are
// not hashed here, since that alone would take all the time.
#include "FuzzInput.h"

#include <server/PasswordChecker.h>

#include <stdexcept>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

using qelo::fuzz::require;

// A file in memory that is used again for each input.
class MemoryFile {
public:
    MemoryFile() : file_(::memfd_create("users", MFD_CLOEXEC)) {
        require(file_ >= 0 && ::fchmod(file_, S_IRUSR | S_IWUSR) == 0);
    }

    void put(std::string_view text) const {
        require(::ftruncate(file_, 0) == 0);
        require(::pwrite(file_, text.data(), text.size(), 0) == static_cast<ssize_t>(text.size()));
    }

    std::string path() const { return "/proc/self/fd/" + std::to_string(file_); }

private:
    int file_;
};

bool isTaken(const MemoryFile& file, std::string_view text) {
    file.put(text);
    try {
        require(qelo::server::userFileChecker(file.path()) != nullptr);
        return true;
    } catch (const std::runtime_error& error) {
        require(std::string(error.what()).rfind(file.path() + ":", 0) == 0);
        require(std::string(error.what()).size() < 200);
        return false;
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const MemoryFile file;
    const std::string text(qelo::fuzz::viewOf(data, size));
    const bool taken = isTaken(file, text);
    // What is in order stays so with one more user, and damage is seen wherever it stands.
    if (!qelo::fuzz::contains(text, "qelo-")) {
        require(isTaken(file, text + "\nqelo-user:$6$salt$hash\n") == taken);
        require(isTaken(file, "qelo-user:$6$salt$hash\n" + text) == taken);
    }
    require(!isTaken(file, text + "\nqelo-user\n"));
    return 0;
}
