#include "ToolRests.h"

#include "AccountFileLock.h"
#include "AccountFileNames.h"

#include <algorithm>
#include <string>
#include <vector>

namespace qelo::store {

namespace {

constexpr std::chrono::milliseconds kNoWait{0};

// "passwd.lock", and "passwd.1234", which the process of that number links to it.
bool isLockOf(const std::string& file, const std::string& name) {
    const std::string stem = file + ".";
    if (name.size() <= stem.size() || name.compare(0, stem.size(), stem) != 0) {
        return false;
    }
    const std::string rest = name.substr(stem.size());
    return rest == "lock" || rest.find_first_not_of("0123456789") == std::string::npos;
}

// Only whoever holds the lock of a file writes its new version.
void removeDraft(const RootDirectory& root, FileSystem& files, const std::string& file) {
    if (const auto lock = AccountFileLock::take(root, files, file, kNoWait)) {
        files.removeFile(root.etc(), file + "+");
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
            if (isLockOf(file, name) && isStaleLock(files, root.etc(), name)) {
                files.removeFile(root.etc(), name);
            }
        }
        if (std::find(names.begin(), names.end(), file + "+") != names.end()) {
            removeDraft(root, files, file);
        }
    }
}

} // namespace qelo::store
