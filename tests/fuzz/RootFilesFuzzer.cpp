// The files that administration commands go by: passwd, shadow and group, login.defs and
// default/useradd. Settings have usable values whatever the files hold, and an account or
// group that a command would change is the one that the provider serves.
#include "FuzzInput.h"

#include <AccountDatabase.h>
#include <AccountFiles.h>
#include <PosixFileSystem.h>
#include <RootDirectory.h>
#include <RootSettings.h>

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <filesystem>
#include <map>
#include <sys/mman.h>

namespace {

using namespace qelo::store;
using qelo::fuzz::require;

// Gives files of a root directory from memory.
class MemoryFiles : public PosixFileSystem {
public:
    std::map<std::string, std::string_view> texts;

    Descriptor open(int directory, const std::string& name, int flags, mode_t mode) override {
        if (name == "default") {
            return Descriptor(::fcntl(directory, F_DUPFD_CLOEXEC, 3));
        }
        const auto found = texts.find(name);
        if (found == texts.end()) {
            return PosixFileSystem::open(directory, name, flags, mode);
        }
        Descriptor file(::memfd_create(name.c_str(), MFD_CLOEXEC));
        const std::string_view text = found->second;
        require(::pwrite(file.get(), text.data(), text.size(), 0) ==
                static_cast<ssize_t>(text.size()));
        return file;
    }

    bool statusAt(int directory, const std::string& name, struct stat& status) override {
        return texts.count(name) != 0 || PosixFileSystem::statusAt(directory, name, status);
    }
};

// A root directory that is open but not there: no run leaves anything behind.
RootDirectory openRoot(FileSystem& files) {
    std::string path = (std::filesystem::temp_directory_path() / "qelo-fuzz-XXXXXX").native();
    require(::mkdtemp(path.data()) != nullptr);
    std::filesystem::create_directory(path + "/etc");
    for (const char* name : {"passwd", "shadow", "group"}) {
        const int file = ::open((path + "/etc/" + name).c_str(), O_CREAT | O_WRONLY, 0600);
        require(file >= 0 && ::close(file) == 0);
    }
    Attempt<RootDirectory> root = RootDirectory::open(path, files);
    std::filesystem::remove_all(path);
    require(static_cast<bool>(root));
    return std::move(*root);
}

struct Setup {
    MemoryFiles files;
    RootDirectory root = openRoot(files);
    Workplace workplace{root, files, systemTools()};
};

void checkValue(const std::string& value) {
    require(!value.empty() && value.find('\n') == std::string::npos);
    constexpr std::string_view blanks = " \t\r";
    require(blanks.find(value.front()) == std::string_view::npos &&
            blanks.find(value.back()) == std::string_view::npos);
}

void checkSettings(Setup& setup, std::string_view loginDefs, std::string_view useradd) {
    setup.files.texts["login.defs"] = loginDefs;
    setup.files.texts["useradd"] = useradd;
    const Attempt<RootSettings> settings = readRootSettings(setup.workplace);
    require(static_cast<bool>(settings));
    require((settings->homeMode & ~mode_t{0777}) == 0);
    checkValue(settings->skeleton);
    checkValue(settings->mailDirectory);

    // The last line counts.
    const std::string longer =
        std::string(loginDefs) +
        "\nCREATE_HOME\tyes\n UMASK 027\nHOME_MODE=0700\nMAIL_DIR /m ail\r\n";
    setup.files.texts["login.defs"] = longer;
    const Attempt<RootSettings> ours = readRootSettings(setup.workplace);
    require(ours && ours->createHome && ours->homeMode == 0700 && ours->mailDirectory == "/m ail");
}

// Names that commands can be about; any other is refused before.
std::vector<std::string> namesIn(std::string_view text) {
    std::vector<std::string> names;
    while (!text.empty() && names.size() < 20) {
        std::string_view line = qelo::fuzz::takePart(text, '\n');
        line.remove_prefix(std::min(line.find_first_not_of(" \t\r\v\f"), line.size()));
        const std::string name(keyOf(line));
        if (!name.empty() &&
            name.find_first_of(std::string_view(",\r\0", 3)) == std::string::npos) {
            names.push_back(name);
        }
    }
    return names;
}

template <class Records> const auto& recordOf(const Records& records, const std::string& name) {
    const auto found = std::find_if(records.begin(), records.end(),
                                    [&](const auto& record) { return record.name == name; });
    require(found != records.end());
    return *found;
}

void checkAccounts(const AccountDatabase& database, std::string_view passwd) {
    qelo::nodes::Damage damage;
    std::string text(passwd);
    const auto served = qelo::nodes::readAccounts(text, damage);
    for (const std::string& name : namesIn(passwd)) {
        require(database.hasAccountName(name));
        const Attempt<Account> account = database.account(name);
        if (!account) {
            require(!account.reason().empty());
            continue;
        }
        const auto& record = recordOf(served, name);
        require(account->uid == record.user && account->gid == record.group);
        require(account->home == record.home && account->shell == record.shell);
        require(account->comment.substr(0, account->comment.find(',')) == record.fullName);
        require(account->shadow.size() == 9 && account->shadow.front() == name);
        require(database.hasUid(account->uid));
    }
}

void checkGroups(const AccountDatabase& database, std::string_view groups) {
    qelo::nodes::Damage damage;
    std::string text(groups);
    const auto served = qelo::nodes::readGroups(text, damage);
    for (const std::string& name : namesIn(groups)) {
        require(database.hasGroupName(name));
        const Attempt<Group> group = database.group(name);
        if (!group) {
            require(!group.reason().empty());
            continue;
        }
        const auto& record = recordOf(served, name);
        require(group->gid == record.number && database.hasGid(group->gid));
        // The system passes over blanks before a member.
        for (const std::string& member : record.members) {
            require(qelo::fuzz::contains(member, "\xEF\xBF\xBD") ||
                    std::any_of(group->members.begin(), group->members.end(),
                                [&](const std::string& known) {
                                    return qelo::fuzz::contains(known, member);
                                }));
        }
    }
}

} // namespace

// The files one after the other, a record separator between them.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static Setup setup;
    constexpr char separator = '\x1e';
    std::string_view text = qelo::fuzz::viewOf(data, size);
    const std::string_view passwd = qelo::fuzz::takePart(text, separator);
    setup.files.texts["passwd"] = passwd;
    setup.files.texts["shadow"] = qelo::fuzz::takePart(text, separator);
    const std::string_view groups = qelo::fuzz::takePart(text, separator);
    setup.files.texts["group"] = groups;
    const std::string_view loginDefs = qelo::fuzz::takePart(text, separator);
    const Attempt<AccountDatabase> database = AccountDatabase::read(setup.root, setup.files);
    require(static_cast<bool>(database));
    checkAccounts(*database, passwd);
    checkGroups(*database, groups);
    checkSettings(setup, loginDefs, text);
    return 0;
}
