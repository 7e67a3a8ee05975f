// Account files with damage of any kind: what is served is what stands in some line, and the
// lines without damage are all served, wherever they stand.
#include "FuzzInput.h"

#include <AccountFiles.h>

#include <algorithm>
#include <set>

namespace {

using namespace qelo::nodes;
using qelo::fuzz::require;

constexpr std::uint32_t noId = 0xFFFFFFFF;

// Names that no input has: see the check before their use.
constexpr const char* sentinels[] = {"qelo-first", "qelo-middle", "qelo-last"};

struct Line {
    std::string_view text;
    bool led = false; // by blanks
};

// The lines of a file, as the C library takes them: a NUL ends the text of a line, and blanks
// before it do not count.
std::vector<Line> linesOf(std::string_view text) {
    std::vector<Line> lines;
    while (!text.empty()) {
        std::string_view line = qelo::fuzz::takePart(text, '\n');
        line = line.substr(0, line.find('\0'));
        const std::size_t start = std::min(line.find_first_not_of(" \t\r\v\f"), line.size());
        lines.push_back({line.substr(start), start > 0});
    }
    return lines;
}

class File {
public:
    explicit File(const std::string& text) : lines_(linesOf(text)) {}

    bool holdsLineOf(const std::string& name) const {
        return anyLineOf(name, [](const Line&) { return true; });
    }

    // The C library repeats some bytes of a line that is led by blanks and does not end in a
    // line feed.
    bool holdsLineWith(const std::string& name, std::string_view part) const {
        return anyLineOf(name, [part](const Line& line) {
            return line.led || qelo::fuzz::contains(line.text, part);
        });
    }

    std::size_t lines() const { return lines_.size(); }

private:
    template <class Holds> bool anyLineOf(const std::string& name, Holds holds) const {
        return std::any_of(lines_.begin(), lines_.end(), [&](const Line& line) {
            return line.text.substr(0, name.size() + 1) == name + ":" && holds(line);
        });
    }

    std::vector<Line> lines_;
};

void checkName(const std::string& name, const File& file) {
    require(!name.empty() && name.front() != '+' && name.front() != '-' && name.front() != '#');
    require(name.find_first_of(std::string_view(":\n\0", 3)) == std::string::npos);
    require(file.holdsLineOf(name));
}

// Too many fields are part of the last one, as the C library has it.
void checkField(const std::string& field, const std::string& name, const File& file,
                bool isLast = false) {
    require(field.find_first_of(std::string_view("\n\0", 2)) == std::string::npos);
    require(isLast || field.find(':') == std::string::npos);
    require(file.holdsLineWith(name, field));
}

// Three undamaged lines: before, amid and behind the text.
std::string amid(std::string_view text, const std::string& rest) {
    const std::size_t middle = std::min(text.find('\n', text.size() / 2), text.size());
    std::string whole = sentinels[0] + rest + "\n";
    whole.append(text.substr(0, middle)).append("\n").append(sentinels[1]).append(rest);
    whole.append(text.substr(middle)).append("\n").append(sentinels[2]).append(rest);
    return whole;
}

// The text of a damage report has bounds and none of the file's content.
void checkDamage(const Damage& damage) {
    const std::string text = damage.text();
    require(text.size() < 1500);
    require(std::all_of(text.begin(), text.end(), [](char c) { return c >= 0x20 && c < 0x7f; }));
}

template <class Records> void checkSentinels(const Records& records) {
    for (const char* name : sentinels) {
        require(std::count_if(records.begin(), records.end(),
                              [&](const auto& record) { return record.name == name; }) == 1);
    }
}

template <class Records> void checkNames(const Records& records, const File& file) {
    std::set<std::string_view> names;
    for (const auto& record : records) {
        checkName(record.name, file);
        require(names.insert(record.name).second);
    }
    require(records.size() <= file.lines());
}

void checkAccounts(std::string_view input) {
    std::string text = amid(input, ":x:1500:100:Full Name,,,:/home/some:/bin/sh");
    const File file(text);
    const std::string before = text;
    Damage damage;
    const std::vector<AccountRecord> accounts = readAccounts(text, damage);
    require(text == before);
    checkNames(accounts, file);
    checkSentinels(accounts);
    for (const AccountRecord& account : accounts) {
        require(account.user != noId && account.group != noId);
        checkField(account.fullName, account.name, file);
        checkField(account.home, account.name, file);
        checkField(account.shell, account.name, file, true);
        if (account.name == sentinels[1]) {
            require(account.user == 1500 && account.group == 100 &&
                    account.fullName == "Full Name" && account.home == "/home/some" &&
                    account.shell == "/bin/sh" && account.password == PasswordUse::elsewhere);
        }
    }
    checkDamage(damage);
}

void checkShadow(std::string_view input) {
    std::string text = amid(input, ":!$6$salt$hash:19000:0:99999:7:30:20000:");
    const File file(text);
    Damage damage;
    const auto records = readShadow(text, damage);
    require(records.size() <= file.lines());
    for (const auto& [name, record] : records) {
        checkName(name, file);
        require(record.password != PasswordUse::elsewhere);
    }
    for (const char* name : sentinels) {
        const ShadowRecord& record = records.at(name);
        require(record.password == PasswordUse::locked && record.lastChange == 19000 &&
                record.minimum == 0 && record.maximum == 99999 && record.warning == 7 &&
                record.inactive == 30 && record.expiry == 20000);
    }
    checkDamage(damage);
}

void checkGroups(std::string_view input) {
    std::string text = amid(input, ":x:1500:alice,bob");
    const File file(text);
    Damage damage;
    const std::vector<GroupRecord> groups = readGroups(text, damage);
    checkNames(groups, file);
    checkSentinels(groups);
    for (const GroupRecord& group : groups) {
        require(group.number != noId);
        for (const std::string& member : group.members) {
            require(!member.empty() && member.find_first_of(",\n") == std::string::npos &&
                    member.find('\0') == std::string::npos);
        }
        if (group.name == sentinels[1]) {
            require(group.number == 1500 &&
                    group.members == std::vector<std::string>{"alice", "bob"});
        }
    }
    checkDamage(damage);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    if (qelo::fuzz::contains(text, "qelo-")) {
        return 0;
    }
    checkAccounts(text);
    checkShadow(text);
    checkGroups(text);
    return 0;
}
