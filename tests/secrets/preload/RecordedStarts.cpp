// A library to be loaded before all others, which writes down with which arguments and which
// environment the program was started, and with which it starts others. It runs inside programs
// under test, between fork and exec as well: no memory is allocated.
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <dlfcn.h>
#include <fcntl.h>
#include <unistd.h>

namespace {

char recordPath[4096] = {};

class Record {
public:
    void add(const char* word, const char* end) {
        addText(word);
        addText(end);
    }
    void addAll(char* const* words) {
        for (; words != nullptr && *words != nullptr; ++words) {
            add(*words, "\n");
        }
    }
    // In one piece, among those of other processes.
    void write() const {
        const int file = ::open(recordPath, O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0600);
        [[maybe_unused]] const ssize_t written = ::write(file, text_, used_);
        ::close(file);
    }

private:
    void addText(const char* text) {
        const std::size_t size = ::strnlen(text, sizeof text_ - used_);
        std::memcpy(text_ + used_, text, size);
        used_ += size;
    }
    char text_[65536];
    std::size_t used_ = 0;
};

void record(const char* what, const char* program, char* const* arguments,
            char* const* environment) {
    Record record;
    record.add(what, " ");
    record.add(program, "\n");
    record.addAll(arguments);
    record.add("with", "\n");
    record.addAll(environment);
    record.write();
}

__attribute__((constructor)) void begin(int, char** arguments, char** environment) {
    if (const char* const path = std::getenv("QELO_RECORDED_STARTS")) {
        std::strncpy(recordPath, path, sizeof recordPath - 1);
        // These are given passwords: the first hides them, a little later, the other does not.
        const char* const name = program_invocation_short_name;
        const bool given = std::strcmp(name, "qelosim") == 0 || std::strcmp(name, "wbemcli") == 0;
        record("begins", arguments[0], given ? nullptr : arguments, environment);
    }
}

} // namespace

extern "C" __attribute__((visibility("default"))) int
execve(const char* program, char* const arguments[], char* const environment[]) {
    using Function = int (*)(const char*, char* const*, char* const*);
    static const auto real = reinterpret_cast<Function>(dlsym(RTLD_NEXT, "execve"));
    if (recordPath[0] != '\0') {
        record("starts", program, arguments, environment);
    }
    return real(program, arguments, environment);
}
