#include "DatabaseCheck.h"

#include <fstream>
#include <map>
#include <set>
#include <sstream>

namespace qelo::test {

namespace {

using Row = std::vector<std::string>;
using Rows = std::vector<Row>;

Row split(const std::string& text, char separator) {
    Row fields{""};
    for (const char c : text) {
        if (c == separator) {
            fields.emplace_back();
        } else {
            fields.back() += c;
        }
    }
    return fields;
}

class Check {
public:
    explicit Check(std::filesystem::path root) : etc_(std::move(root) / "etc") {}

    std::vector<std::string> run() {
        const Rows passwd = read("passwd", 7);
        const Rows group = read("group", 4);
        const Rows gshadow = read("gshadow", 4);
        expectSameNames(passwd, read("shadow", 9), "passwd and shadow");
        expectSameNames(group, gshadow, "group and gshadow");
        expectUniqueNumbers(passwd, "passwd");
        expectUniqueNumbers(group, "group");
        expectGroupsOf(passwd, group);
        expectSameMembers(group, gshadow);
        expectAccountsOf(read("subuid", 3), passwd, "subuid");
        expectAccountsOf(read("subgid", 3), passwd, "subgid");
        expectNothingLeft();
        return faults_;
    }

private:
    Rows read(const std::string& name, std::size_t count) {
        Rows rows;
        std::ifstream file(etc_ / name);
        std::string line;
        while (std::getline(file, line)) {
            rows.push_back(split(line, ':'));
            expect(rows.back().size() == count, "malformed line in " + name + ": " + line);
            rows.back().resize(count);
        }
        return rows;
    }

    void expect(bool holds, const std::string& fault) {
        if (!holds) {
            faults_.push_back(fault);
        }
    }

    static std::map<std::string, int> namesOf(const Rows& rows) {
        std::map<std::string, int> names;
        for (const Row& row : rows) {
            ++names[row[0]];
        }
        return names;
    }

    void expectSameNames(const Rows& one, const Rows& other, const std::string& what) {
        const auto names = namesOf(one);
        expect(names == namesOf(other), "different names in " + what);
        for (const auto& [name, count] : names) {
            expect(count == 1, "name twice in " + what + ": " + name);
        }
    }

    void expectUniqueNumbers(const Rows& rows, const std::string& what) {
        std::set<std::string> numbers;
        for (const Row& row : rows) {
            expect(numbers.insert(row[2]).second, "number twice in " + what + ": " + row[2]);
        }
    }

    void expectGroupsOf(const Rows& passwd, const Rows& group) {
        std::set<std::string> numbers;
        for (const Row& row : group) {
            numbers.insert(row[2]);
        }
        for (const Row& row : passwd) {
            expect(numbers.count(row[3]) == 1, "no group for account " + row[0]);
        }
    }

    void expectSameMembers(const Rows& group, const Rows& gshadow) {
        std::map<std::string, std::string> shadowed;
        for (const Row& row : gshadow) {
            shadowed[row[0]] = row[3];
        }
        for (const Row& row : group) {
            const Row members = split(row[3], ',');
            expect(shadowed[row[0]] == row[3], "members differ in gshadow: " + row[0]);
            expect(std::set<std::string>(members.begin(), members.end()).size() == members.size(),
                   "member twice in " + row[0]);
        }
    }

    void expectAccountsOf(const Rows& ranges, const Rows& passwd, const std::string& what) {
        const auto names = namesOf(passwd);
        for (const Row& row : ranges) {
            expect(names.count(row[0]) == 1, "no account for a range in " + what + ": " + row[0]);
        }
    }

    void expectNothingLeft() {
        const std::set<std::string> allowed{
            "passwd",     "passwd-",  "shadow", "shadow-",       "group",    "group-",
            "gshadow",    "gshadow-", "subuid", "subuid-",       "subgid",   "subgid-",
            "login.defs", "default",  "skel",   ".qelosim.lock", ".pwd.lock"};
        for (const auto& entry : std::filesystem::directory_iterator(etc_)) {
            const std::string name = entry.path().filename().string();
            expect(allowed.count(name) == 1, "left behind in etc: " + name);
        }
    }

    std::filesystem::path etc_;
    std::vector<std::string> faults_;
};

} // namespace

std::vector<std::string> findFaults(const std::filesystem::path& root) { return Check(root).run(); }

} // namespace qelo::test
