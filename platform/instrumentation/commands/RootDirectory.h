// The root directory whose account database commands change, held open.
#pragma once

#include "Attempt.h"
#include "FileSystem.h"

#include <filesystem>
#include <string>

namespace qelo::store {

class RootDirectory {
public:
    // Opens `path` and its "etc". Refused is a root on which a command could be turned
    // against the rest of the machine or would fail half-way: one that is missing, whose
    // directories belong to somebody else than this process or the superuser or may be
    // written by everybody, whose account files are missing or symbolic links (the tools
    // follow these and would write to their targets), or whose "etc" cannot be written.
    static Attempt<RootDirectory> open(const std::filesystem::path& path, FileSystem& files);

    // Without symbolic links; "/" for the machine's own root.
    const std::string& path() const { return path_; }
    // Whether this is the machine's own root, for which tools take no prefix.
    bool isSystemRoot() const { return path_ == "/"; }
    int top() const { return top_.get(); }
    int etc() const { return etc_.get(); }

private:
    RootDirectory() = default;

    std::string path_;
    Descriptor top_;
    Descriptor etc_;
};

} // namespace qelo::store
