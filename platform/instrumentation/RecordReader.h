// Reads the records of an account file with the C library's own readers, so that what is
// served is what the system's own look-ups see.
//
// The readers are the reentrant ones, over a copy in memory: a file that is replaced or
// cut short meanwhile does no harm. Buffers are wiped, since a password file may hold hashes.
#pragma once

#include "RecordLines.h"

#include <cerrno>
#include <cstdio>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace qelo::nodes {

// A text as a stream of records.
class RecordStream {
public:
    // One call of a C library reader: 0 for a record, else an errno value.
    using ReadOne = std::function<int(FILE*, char*, std::size_t)>;

    RecordStream(std::string& text, RecordLines& lines);
    ~RecordStream();
    RecordStream(const RecordStream&) = delete;
    RecordStream& operator=(const RecordStream&) = delete;

    // Reads the next record; false at the end. The record points into a buffer of this
    // object and is valid until the next call.
    bool next(const ReadOne& readOne);

private:
    bool recover(int error);
    bool skipLine();
    bool growFor(std::size_t line);
    std::size_t position() const;

    RecordLines& lines_;
    std::size_t size_;
    std::vector<char> streamBuffer_;
    std::vector<char> recordBuffer_;
    std::unique_ptr<FILE, int (*)(FILE*)> stream_;
};

// Calls visit(record) for each record of the text. Lines that are none are reported.
template <class Record, class Visit>
void readRecords(std::string& text, RecordLines& lines,
                 int (*read)(FILE*, Record*, char*, std::size_t, Record**), Visit visit) {
    RecordStream stream(text, lines);
    Record record{};
    const auto readOne = [&](FILE* file, char* buffer, std::size_t size) {
        Record* found = nullptr;
        const int error = read(file, &record, buffer, size, &found);
        return error == 0 && !found ? ENOENT : error;
    };
    while (stream.next(readOne)) {
        visit(static_cast<const Record&>(record));
    }
}

} // namespace qelo::nodes
