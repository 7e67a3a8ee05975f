// The local account database below a root directory, as nodes. Only reads, but for commands.
//
// A selection of accounts fails when etc/passwd cannot be read, one of groups when etc/group
// cannot; everything fails when the root is not a directory. Without etc/shadow the accounts
// are there, with what etc/passwd alone tells. etc/gshadow holds nothing that a property
// tells, only hashes and administrators, and is not opened.
#pragma once

#include "Source.h"

#include <filesystem>

namespace qelo::nodes {

class AccountSource : public Source {
public:
    AccountSource(std::filesystem::path root, Files& files);

    std::shared_ptr<const Snapshot> take() override;
    bool execute(const std::string& command, std::string& status) override;

private:
    std::filesystem::path root_;
    Files& files_;
};

} // namespace qelo::nodes
