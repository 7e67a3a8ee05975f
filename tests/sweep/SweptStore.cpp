#include "SweptStore.h"

#include <Instrumentation.h>

#include <chrono>
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <map>
#include <sys/stat.h>
#include <thread>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

using namespace Tesk::NodeLexicon;

constexpr const char* kVariable = "QELO_NODE_STORE";
constexpr const char* kLongAccount = "an account with quite a long name";
constexpr const char* kLongGroup = "a group with quite a long name";

// One less than the platform keeps.
constexpr int kFillers = 15;

std::map<std::string, std::string> accountFiles() {
    const std::string account = kLongAccount;
    const std::string group = kLongGroup;
    return {{"passwd", account +
                           ":x:1000:1000:A full name that is long,Room:"
                           "/home/a directory with a long name:/bin/a shell with a long name\n"
                           "damaged:x:no number at all:0:::\n"
                           "bob:x:1001:1000:\xFF is no text in UTF-8:/home/bob:/bin/sh\n"},
            {"shadow", account + ":$y$j9T$a salt$a hash that is long:19000:1:99999:7:30:25000:\n"
                                 "bob:!:19000:0:99999:7:::\n"
                                 "bob:*:19000:0:99999:7:::\n"},
            {"group", group + ":x:1000:root,bob,another member with a long name\n"
                              "a line that is no group at all\n"
                              "adm:x:1001:\n"},
            {"security/faillock.conf", "# what a comment says\ndeny = 5\nsilent\n"},
            {"security/pwhistory.conf", "remember = a number that is none\n"},
            {"security/pwquality.conf", "minlen = 12\ndcredit = -1\n"},
            {"security/pwquality.conf.d/10-a file with a long name.conf", "ucredit = -1\n"},
            {"pam.d/common-password",
             "password requisite pam_pwquality.so retry=3 lcredit=-1\n"
             "password [success=1 default=ignore] pam_unix.so obscure remember=5\n"}};
}

std::string quoted(const std::string& text) { return '"' + text + '"'; }

std::string member(int property, const std::string& value) {
    return quoted(std::to_string(property)) + ": " + value;
}

std::string node(NodeType type, const std::string& path, const std::string& properties) {
    return "{\"type\": " + std::to_string(type) + ", \"path\": " + quoted(path) +
           ", \"properties\": {" + properties + "}}";
}

// The store tells more entries than it has nodes, so that a re-read is asked for.
std::string account(const std::string& name, const std::string& more) {
    return node(UserAccount, "/UserAdministration/1/UserAccount/" + name,
                member(Name, quoted(name)) + ", " + member(AccountState, "1") + ", " +
                    member(EntryCount, "9") + more);
}

std::string group(const std::string& name, const std::string& members) {
    return node(UserGroup, "/UserAdministration/1/UserGroup/" + name,
                member(Name, quoted(name)) + ", " + member(EntryCount, "9") + ", " +
                    member(GroupMembers, members));
}

std::string nodeFile() {
    const std::string more = ", " + member(FullName, quoted("A full name with \\u00e4 in it")) +
                             ", " + member(HomeDirectory, quoted("/home/a directory of someone")) +
                             ", " + member(PasswordRules, "[1, 7, 3]");
    return "{\"nodes\": [" + node(UserAdministration, "/UserAdministration/1", "") + ",\n" +
           account(kLongAccount, more) + ",\n" + account("bob", "") + ",\n" +
           group(kLongGroup, "[\"root\", \"a member with a long name\"]") + ",\n" +
           group("adm", "[]") + ",\n" + node(AccountServiceRoot, "/b", "") + ",\n" +
           node(AccountServiceRoot, "/a", "") + "]}\n";
}

void write(const fs::path& file, const std::string& content) {
    fs::create_directories(file.parent_path());
    std::ofstream(file, std::ios::binary) << content;
}

// The platform does not trust what it has read of a file that was changed a moment before: the
// next change could leave the time stamp as it is.
void waitForTrust(const fs::path& file) {
    constexpr std::int64_t nsPerSecond = 1'000'000'000;
    constexpr std::int64_t grainNs = 60'000'000;
    struct stat status {};
    if (::stat(file.c_str(), &status) != 0) {
        return;
    }
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    const std::int64_t age =
        (now.tv_sec - status.st_ctim.tv_sec) * nsPerSecond + (now.tv_nsec - status.st_ctim.tv_nsec);
    const bool coarse = status.st_ctim.tv_nsec == 0;
    const std::int64_t wanted = coarse ? 3 * nsPerSecond : grainNs;
    if (age >= 0 && age < wanted) {
        std::this_thread::sleep_for(std::chrono::nanoseconds(wanted - age));
    }
}

void ask(const std::string& choice) {
    ::setenv(kVariable, choice.c_str(), 1);
    const Tesk::Instrumentation cursor;
}

void askFillers() {
    for (int i = 0; i < kFillers; ++i) {
        ask("filler:" + std::to_string(i));
    }
}

} // namespace

std::vector<std::string> platformLibraries() {
    return {QELO_STORE_LIBRARY, QELO_COMMON_LIBRARY, QELO_UTILITIES_LIBRARY};
}

SweptStore::SweptStore(Kind kind, const fs::path& directory) {
    if (kind == Kind::NodeFile) {
        write(directory / "nodes.json", nodeFile());
        choice_ = "file:" + (directory / "nodes.json").native();
        waitForTrust(directory / "nodes.json");
        return;
    }
    for (const auto& [name, content] : accountFiles()) {
        write(directory / "etc" / name, content);
        waitForTrust(directory / "etc" / name);
    }
    choice_ = "accounts:" + directory.native();
}

void SweptStore::makeKnown(const fs::path& root) {
    const fs::path etc = root / "etc";
    for (const char* name : {"passwd", "shadow", "group"}) {
        waitForTrust(etc / name);
    }
    ::setenv(kVariable, ("accounts:" + root.native()).c_str(), 1);
    Tesk::Instrumentation().selectNode(UserAdministration);
}

void SweptStore::choose() const { ::setenv(kVariable, choice_.c_str(), 1); }

// The platform drops what was longest unused: first this store, and when it is asked for
// again, what is asked for in between.
void SweptStore::forget() {
    askFillers();
    ask("between");
    askFillers();
}

} // namespace qelo::test
