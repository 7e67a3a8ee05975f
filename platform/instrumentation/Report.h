// The store's voice in the log: component "Qelo.NodeStore", level 6000.
#pragma once

#include "Snapshot.h"

#include <map>
#include <mutex>
#include <string>
#include <utility>

namespace qelo::nodes {

// Writes one line to the log. Control characters of the text are escaped.
void logFailure(const std::string& text);

// Tells each state of a file once, however often the file is read. For any thread.
class Reporter {
public:
    void tell(const Snapshot& snapshot);

private:
    using Told = std::pair<FileStamp, std::string>;
    bool isNew(const FileReport& report);

    std::mutex mutex_;
    std::map<std::string, Told> told_;
};

} // namespace qelo::nodes
