#include "Output.h"

#include <cerrno>
#include <cstdlib>
#include <poll.h>
#include <sys/ioctl.h>
#include <system_error>
#include <unistd.h>

namespace qelo::cli {
namespace {

constexpr std::size_t kBufferSize = 65536;
constexpr std::size_t kDefaultColumns = 80;

std::size_t terminalColumns(int descriptor) {
    winsize size{};
    if (ioctl(descriptor, TIOCGWINSZ, &size) == 0 && size.ws_col > 0) {
        return size.ws_col;
    }
    return kDefaultColumns;
}

bool coloursAreWelcome() {
    const char* const noColour = std::getenv("NO_COLOR");
    const char* const terminal = std::getenv("TERM");
    return (noColour == nullptr || *noColour == '\0') && terminal != nullptr &&
           std::string_view(terminal) != "dumb";
}

// Waits until a descriptor that somebody else made non-blocking takes more.
void waitUntilWritable(int descriptor) {
    pollfd entry{descriptor, POLLOUT, 0};
    poll(&entry, 1, -1);
}

} // namespace

OutputError::OutputError(int error)
    : std::runtime_error(std::generic_category().message(error)), error_(error) {}

bool OutputError::readerHasGone() const { return error_ == EPIPE; }

FileOutput::FileOutput(int descriptor) : descriptor_(descriptor) {
    if (isatty(descriptor) == 1) {
        columns_ = terminalColumns(descriptor);
        colours_ = coloursAreWelcome();
    }
}

void FileOutput::write(std::string_view text) {
    buffer_ += text;
    if (buffer_.size() >= kBufferSize) {
        flush();
    }
}

void FileOutput::flush() {
    std::string_view rest = buffer_;
    while (!rest.empty()) {
        const ssize_t written = ::write(descriptor_, rest.data(), rest.size());
        if (written >= 0) {
            rest.remove_prefix(static_cast<std::size_t>(written));
        } else if (errno == EAGAIN) {
            waitUntilWritable(descriptor_);
        } else if (errno != EINTR) {
            const int error = errno;
            buffer_.clear();
            throw OutputError(error);
        }
    }
    buffer_.clear();
}

} // namespace qelo::cli
