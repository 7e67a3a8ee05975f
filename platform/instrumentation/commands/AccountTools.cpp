#include "AccountTools.h"

#include "AccountFileNames.h"
#include "FieldRules.h"

#include <algorithm>
#include <array>
#include <ctime>
#include <thread>

namespace qelo::store {

namespace {

constexpr const char* kUseradd = "/usr/sbin/useradd";
constexpr const char* kUsermod = "/usr/sbin/usermod";
constexpr const char* kUserdel = "/usr/sbin/userdel";
constexpr const char* kGroupadd = "/usr/sbin/groupadd";
constexpr const char* kGroupdel = "/usr/sbin/groupdel";
constexpr const char* kChpasswd = "/usr/sbin/chpasswd";
constexpr const char* kChage = "/usr/bin/chage";
constexpr const char* kGpasswd = "/usr/bin/gpasswd";

// How long a tool is run again that finds its files locked by somebody else.
constexpr std::chrono::seconds kContentionLimit{60};
constexpr std::chrono::milliseconds kContentionPause{50};

constexpr long kSecondsPerDay = 24L * 60 * 60;

// "--name=value", so that no value can be taken for an option.
template <typename T> std::string option(const char* name, const T& value) {
    if constexpr (std::is_arithmetic_v<T>) {
        return std::string(name) + "=" + std::to_string(value);
    } else {
        return std::string(name) + "=" + value;
    }
}

template <typename T>
void addOption(std::vector<std::string>& options, const char* name, const std::optional<T>& value) {
    if (value) {
        options.push_back(option(name, *value));
    }
}

bool says(const ToolResult& result, const char* text) {
    return result.message.find(text) != std::string::npos;
}

// Why no lock can be made, whoever else holds it; in the tools' language (see ToolRunner.h).
bool leavesNoHope(const ToolResult& result) {
    constexpr std::array<const char*, 3> kReasons{"No space left on device", "Disk quota exceeded",
                                                  "Read-only file system"};
    return std::any_of(kReasons.begin(), kReasons.end(),
                       [&](const char* reason) { return says(result, reason); });
}

bool onlyFailedToLock(const ToolResult& result) {
    return result.end == ToolResult::End::Exited && result.code != 0 &&
           says(result, "cannot lock") && !leavesNoHope(result);
}

std::string firstLine(const std::string& text) { return text.substr(0, text.find('\n')); }

std::string describe(const ToolCall& call, const ToolResult& result) {
    const std::string program = call.program.substr(call.program.rfind('/') + 1);
    switch (result.end) {
    case ToolResult::End::Exited:
        return result.message.empty()
                   ? program + " failed with status " + std::to_string(result.code)
                   : printable(firstLine(result.message));
    case ToolResult::End::TimedOut:
        return program + " took too long";
    case ToolResult::End::Killed:
        return program + " was killed";
    case ToolResult::End::NotStarted:
        break;
    }
    return program + " could not be started";
}

// usermod takes what reads as a number for a group's number, even where it is a name.
bool canNameGroup(const std::string& group) {
    return group.find_first_not_of("0123456789+- ") != std::string::npos;
}

template <typename T> void setField(Fields& fields, std::size_t index, const std::optional<T>& v) {
    if (v) {
        fields.at(index) = std::to_string(*v);
    }
}

// Changes the fields of the one line of `key` under the tools' lock.
template <typename Change>
Problem changeLine(const Workplace& workplace, const char* file, const std::string& key,
                   std::size_t count, Change change) {
    bool found = false;
    const Problem problem = editLines(workplace.root, workplace.files, file, [&](Lines& lines) {
        const auto line = std::find_if(lines.begin(), lines.end(),
                                       [&](const std::string& l) { return keyOf(l) == key; });
        Fields fields = line == lines.end() ? Fields{} : splitFields(*line, ':');
        found = fields.size() == count;
        if (found) {
            change(fields);
            *line = joinFields(fields, ':');
        }
        return found;
    });
    return problem || found ? problem : Problem(std::string("no proper entry in etc/") + file);
}

void dropName(std::string& list, const std::string& name) {
    Fields names = splitFields(list, ',');
    names.erase(std::remove(names.begin(), names.end(), name), names.end());
    list = joinFields(names, ',');
}

void appendName(std::string& list, const std::string& name) {
    list += list.empty() ? name : "," + name;
}

// The members as group and gshadow hold them, for the cases that no tool can do.
template <typename Change>
Problem changeMembersInFiles(const Workplace& workplace, const std::string& group, Change change) {
    const auto changeMembers = [&](Fields& fields) { change(fields.at(3)); };
    if (Problem problem = changeLine(workplace, kGroup, group, 4, changeMembers)) {
        return problem;
    }
    const Attempt<Lines> lines = readLines(workplace.root, workplace.files, kGshadow);
    if (!lines) {
        return lines.reason();
    }
    const bool listed = std::any_of(lines->begin(), lines->end(),
                                    [&](const std::string& line) { return keyOf(line) == group; });
    return listed ? changeLine(workplace, kGshadow, group, 4, changeMembers) : Problem();
}

} // namespace

Problem AccountTools::run(const ToolCall& call) const {
    const auto end = std::chrono::steady_clock::now() + kContentionLimit;
    ToolResult result = workplace_.tools.run(call);
    while (onlyFailedToLock(result) && std::chrono::steady_clock::now() < end) {
        std::this_thread::sleep_for(kContentionPause);
        result = workplace_.tools.run(call);
    }
    return result.done() ? Problem() : describe(call, result);
}

Problem AccountTools::runOnName(const char* program, std::vector<std::string> options,
                                const std::string& name) const {
    ToolCall call;
    call.program = program;
    if (!workplace_.root.isSystemRoot()) {
        call.arguments = {"--prefix", workplace_.root.path()};
    }
    call.arguments.insert(call.arguments.end(), options.begin(), options.end());
    call.arguments.insert(call.arguments.end(), {"--", name});
    return run(call);
}

Problem AccountTools::addAccount(const NewAccount& account) const {
    std::vector<std::string> options{"--no-create-home"};
    if (!workplace_.root.isSystemRoot()) {
        options.push_back("--no-log-init");
    }
    addOption(options, "--comment", account.comment);
    addOption(options, "--home-dir", account.home);
    addOption(options, "--shell", account.shell);
    addOption(options, "--uid", account.uid);
    addOption(options, "--gid", account.gid);
    return runOnName(kUseradd, options, account.name);
}

Problem AccountTools::changeAccount(const Account& account, const AccountChange& change) const {
    std::vector<std::string> options;
    addOption(options, "--comment", change.comment);
    addOption(options, "--home", change.home);
    addOption(options, "--shell", change.shell);
    if (workplace_.root.isSystemRoot()) {
        addOption(options, "--uid", change.uid);
        addOption(options, "--gid", change.gid);
    }
    if (!options.empty()) {
        if (Problem problem = runOnName(kUsermod, options, account.name)) {
            return problem;
        }
    }
    if (workplace_.root.isSystemRoot() || (!change.uid && !change.gid)) {
        return {};
    }
    return changeLine(workplace_, kPasswd, account.name, 7, [&](Fields& fields) {
        setField(fields, 2, change.uid);
        setField(fields, 3, change.gid);
    });
}

Problem AccountTools::lockAccount(const std::string& name) const {
    return runOnName(kUsermod, {"--lock"}, name);
}

Problem AccountTools::unlockAccount(const std::string& name) const {
    return runOnName(kUsermod, {"--unlock"}, name);
}

Problem AccountTools::deleteAccount(const std::string& name) const {
    return runOnName(kUserdel, {}, name);
}

Problem AccountTools::changeWithChage(const std::string& name, const Ageing& ageing) const {
    ToolCall call;
    call.program = kChage;
    addOption(call.arguments, "--mindays", ageing.minimum);
    addOption(call.arguments, "--maxdays", ageing.maximum);
    addOption(call.arguments, "--warndays", ageing.warning);
    addOption(call.arguments, "--inactive", ageing.inactive);
    addOption(call.arguments, "--expiredate", ageing.expiry);
    call.arguments.insert(call.arguments.end(), {"--", name});
    return run(call);
}

// The hash goes over standard input: an argument vector is visible to every user.
Problem AccountTools::changeWithChpasswd(const std::string& name, const Secret& hash) const {
    ToolCall call;
    call.program = kChpasswd;
    call.arguments = {"--encrypted"};
    call.input = Secret({name, ":", hash.view(), "\n"});
    return run(call);
}

Problem AccountTools::changeShadow(const std::string& name, const Ageing& ageing,
                                   const Secret* hash) const {
    if (workplace_.root.isSystemRoot()) {
        if (ageing.any()) {
            if (Problem problem = changeWithChage(name, ageing)) {
                return problem;
            }
        }
        return hash != nullptr ? changeWithChpasswd(name, *hash) : Problem();
    }
    if (!ageing.any() && hash == nullptr) {
        return {};
    }
    return changeLine(workplace_, kShadow, name, 9, [&](Fields& fields) {
        if (hash != nullptr) {
            fields[1] = hash->text();
            fields[2] = std::to_string(std::time(nullptr) / kSecondsPerDay);
        }
        setField(fields, 3, ageing.minimum);
        setField(fields, 4, ageing.maximum);
        setField(fields, 5, ageing.warning);
        setField(fields, 6, ageing.inactive);
        setField(fields, 7, ageing.expiry);
    });
}

Problem AccountTools::addGroup(const std::string& name, std::optional<std::uint32_t> gid) const {
    std::vector<std::string> options;
    addOption(options, "--gid", gid);
    return runOnName(kGroupadd, options, name);
}

Problem AccountTools::deleteGroup(const std::string& name) const {
    return runOnName(kGroupdel, {}, name);
}

Problem AccountTools::changeMembership(const std::string& group, const std::string& member,
                                       const char* groupOption) const {
    ToolCall call;
    call.program = kGpasswd;
    call.arguments = {option(groupOption, member), "--", group};
    return run(call);
}

Problem AccountTools::addMember(const std::string& group, const std::string& member) const {
    if (workplace_.root.isSystemRoot()) {
        return changeMembership(group, member, "--add");
    }
    if (canNameGroup(group)) {
        return runOnName(kUsermod, {"--append", option("--groups", group)}, member);
    }
    return changeMembersInFiles(workplace_, group,
                                [&](std::string& list) { appendName(list, member); });
}

Problem AccountTools::removeMember(const std::string& group, const std::string& member,
                                   bool isAccount) const {
    if (workplace_.root.isSystemRoot()) {
        return changeMembership(group, member, "--delete");
    }
    if (isAccount && canNameGroup(group)) {
        return runOnName(kUsermod, {"--remove", option("--groups", group)}, member);
    }
    return changeMembersInFiles(workplace_, group,
                                [&](std::string& list) { dropName(list, member); });
}

} // namespace qelo::store
