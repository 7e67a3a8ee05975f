// The way back: the entries that a command is going to change, as they were before it.
//
// A command that fails half-way is undone by writing the old entries back, and not by running
// more tools: a tool that has just failed is the last thing to rely on. Only the entries of
// the command's own names are touched, under the tools' locks, so that what others did to
// other entries in the meantime stays.
#pragma once

#include "AccountFileNames.h"
#include "AccountTable.h"

#include <array>
#include <string>

namespace qelo::store {

class EntrySnapshot {
public:
    // Remembers
    //   account  its lines in passwd, shadow, subuid and subgid, and which groups it is in
    //   group    whether it exists, with its lines in group and gshadow
    // Either may be empty. `root` and `files` must outlive the snapshot.
    static Attempt<EntrySnapshot> take(const RootDirectory& root, FileSystem& files,
                                       std::string account, std::string group);

    // Makes these entries what they were; files in which nothing differs are not written. At
    // every moment an account in passwd has its line in shadow. Goes through all files even if
    // one fails and returns the first problem.
    Problem restore() const;

private:
    EntrySnapshot(const RootDirectory& root, FileSystem& files) : root_(&root), files_(&files) {}

    Problem restoreFile(const char* name) const;
    bool putBack(const std::string& file, Lines& now) const;
    const Lines& before(const std::string& file) const;

    const RootDirectory* root_;
    FileSystem* files_;
    std::string account_;
    std::string group_;
    // In the order of kAccountFiles.
    std::array<Lines, kAccountFiles.size()> before_;
};

} // namespace qelo::store
