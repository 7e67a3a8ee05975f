// What tests of commands share: a scratch root that goes away, and ways to look at it.
#pragma once

#include "AdminCommand.h"
#include "DatabaseCheck.h"
#include "RecordingTools.h"

#include <filesystem>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <map>
#include <string>
#include <vector>

namespace qelo::test {

// A directory that is removed with its owner.
class ScratchDirectory {
public:
    ScratchDirectory();
    ~ScratchDirectory();
    ScratchDirectory(const ScratchDirectory&) = delete;
    ScratchDirectory& operator=(const ScratchDirectory&) = delete;

    const std::filesystem::path& path() const { return path_; }

private:
    std::filesystem::path path_;
};

// One argument of a command.
std::string text(const std::string& name, const std::string& value);
std::string number(const std::string& name, long value);
std::string dateTime(const std::string& name, const std::string& value);

// METHOD,ARGUMENT,ARGUMENT...
std::string command(const std::string& method, const std::vector<std::string>& arguments);

std::string contentOf(const std::filesystem::path& file);
void write(const std::filesystem::path& file, const std::string& content);

// The account files and everything else below a root, by path: content, mode, owner. Left out
// are the lock file of commands and the backups that tools make ("passwd-").
std::map<std::string, std::string> stateOf(const std::filesystem::path& root);

// The fields of the line of `key`, empty when there is none.
std::vector<std::string> lineOf(const std::filesystem::path& file, const std::string& key);

bool isSuperuser();

// A test on a scratch root. At its end the account files must belong together.
class CommandTest : public testing::Test {
protected:
    CommandTest();
    void TearDown() override;

    const std::filesystem::path& root() const { return root_; }
    std::filesystem::path etc(const std::string& name) const { return root_ / "etc" / name; }

    // Runs a command through the public function.
    store::CommandOutcome run(const std::string& method,
                              const std::vector<std::string>& arguments) const;
    // The same, expecting success.
    void accept(const std::string& method, const std::vector<std::string>& arguments) const;
    // The same, expecting a refusal that leaves everything as it is; returns the reason.
    std::string refuse(const std::string& method, const std::vector<std::string>& arguments) const;

    std::vector<std::string> passwd(const std::string& name) const;
    std::vector<std::string> shadow(const std::string& name) const;
    std::vector<std::string> group(const std::string& name) const;

    // For tests that damage the files on purpose.
    void expectFaults() { expectFaults_ = true; }

private:
    ScratchDirectory scratch_;
    std::filesystem::path root_;
    bool expectFaults_ = false;
};

} // namespace qelo::test
