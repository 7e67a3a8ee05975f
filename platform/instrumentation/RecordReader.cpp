#include "RecordReader.h"

#include <cstring>

namespace qelo::nodes {

namespace {

constexpr std::size_t streamBufferSize = 65536;
constexpr std::size_t firstRecordBuffer = 4096;
constexpr std::size_t longestLine = 16UL * 1024 * 1024;

// A line of short group members needs a pointer for each two of its bytes.
constexpr std::size_t roomFor(std::size_t line) { return 8 * line + firstRecordBuffer; }

void wipe(std::vector<char>& buffer) { ::explicit_bzero(buffer.data(), buffer.size()); }

} // namespace

RecordStream::RecordStream(std::string& text, RecordLines& lines)
    : lines_(lines), size_(text.size()), streamBuffer_(streamBufferSize),
      recordBuffer_(firstRecordBuffer), stream_(nullptr, std::fclose) {
    if (text.empty()) {
        return;
    }
    stream_.reset(::fmemopen(text.data(), text.size(), "r"));
    if (!stream_) {
        throw std::bad_alloc();
    }
    // Refused, the stream has a buffer of its own.
    (void)std::setvbuf(stream_.get(), streamBuffer_.data(), _IOFBF, streamBuffer_.size());
}

RecordStream::~RecordStream() {
    stream_.reset();
    wipe(streamBuffer_);
    wipe(recordBuffer_);
}

std::size_t RecordStream::position() const {
    const off_t at = ::ftello(stream_.get());
    return at < 0 ? size_ : static_cast<std::size_t>(at);
}

bool RecordStream::next(const ReadOne& readOne) {
    while (stream_) {
        const int error = readOne(stream_.get(), recordBuffer_.data(), recordBuffer_.size());
        if (error == 0) {
            lines_.recordEndsAt(position());
            return true;
        }
        if (!recover(error)) {
            break;
        }
    }
    lines_.finish();
    return false;
}

// After an error the reader stands before the line that it could not read, or at the end.
bool RecordStream::recover(int error) {
    const std::size_t at = position();
    if (at >= size_) {
        return false;
    }
    const std::size_t line = lines_.lineAt(at).size();
    return (error == ERANGE && growFor(line)) || skipLine();
}

bool RecordStream::growFor(std::size_t line) {
    const std::size_t wanted = roomFor(line);
    if (line > longestLine || wanted <= recordBuffer_.size()) {
        return false;
    }
    wipe(recordBuffer_);
    recordBuffer_.assign(wanted, '\0');
    return true;
}

bool RecordStream::skipLine() {
    const std::size_t after = position() + lines_.lineAt(position()).size() + 1;
    return after < size_ && ::fseeko(stream_.get(), static_cast<off_t>(after), SEEK_SET) == 0;
}

} // namespace qelo::nodes
