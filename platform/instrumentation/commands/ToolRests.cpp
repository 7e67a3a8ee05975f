#include "ToolRests.h"

#include "AccountFileLock.h"
#include "AccountFileNames.h"
#include "FileText.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <csignal>
#include <string>
#include <unistd.h>
#include <vector>

namespace qelo::store {

namespace {

constexpr std::chrono::milliseconds kNoWait{0};

// The end of a name that begins like a lock of `file`: of "passwd.lock" the word, of
// "passwd.1234", which the process of that number links to it, the number.
std::string endOf(const std::string& name, const std::string& file) {
    const std::string stem = file + ".";
    return name.compare(0, stem.size(), stem) == 0 ? name.substr(stem.size()) : std::string();
}

// Its content does not count: who was killed in the midst of writing it has left it empty.
bool isLeftByProcess(const std::string& number) {
    pid_t process = 0;
    const char* const end = number.data() + number.size();
    const auto read = std::from_chars(number.data(), end, process);
    return read.ec == std::errc() && read.ptr == end && process > 0 &&
           (process == ::getpid() || (::kill(process, 0) != 0 && errno == ESRCH));
}

bool isStale(const RootDirectory& root, FileSystem& files, const std::string& file,
             const std::string& name) {
    const std::string end = endOf(name, file);
    return end == "lock" ? isStaleLock(files, root.etc(), name) : isLeftByProcess(end);
}

// Only whoever holds the lock of a file writes its new version.
void removeDraft(const RootDirectory& root, FileSystem& files, const std::string& file,
                 const std::string& draft) {
    if (const auto lock = AccountFileLock::take(root, files, file, kNoWait)) {
        removeSurely(files, root.etc(), draft);
    }
}

} // namespace

void removeToolRests(const RootDirectory& root, FileSystem& files) {
    std::vector<std::string> names;
    if (!files.list(root.etc(), names)) {
        return;
    }
    for (const std::string file : kAccountFiles) {
        for (const std::string& name : names) {
            if (isStale(root, files, file, name)) {
                removeSurely(files, root.etc(), name);
            }
        }
        for (const std::string& draft : {file + "+", draftOf(file)}) {
            if (std::find(names.begin(), names.end(), draft) != names.end()) {
                removeDraft(root, files, file, draft);
            }
        }
    }
}

} // namespace qelo::store
