#include "ChangingStore.h"

#include <NodeLexicon.h>

#include <chrono>
#include <fstream>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <thread>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

using namespace Tesk::NodeLexicon;

constexpr std::size_t kOfBoth = 12;

char letterOf(std::size_t population) { return population == 0 ? 'A' : 'B'; }

// Names that both populations have, and some that only this one has; of these it has more or
// fewer than the other.
std::vector<std::string> namesOf(std::size_t population, const std::string& stem) {
    std::vector<std::string> names;
    for (std::size_t i = 0; i < kOfBoth; ++i) {
        names.push_back(stem + "both" + std::to_string(i));
    }
    const std::string own = stem + (population == 0 ? "a" : "b");
    for (std::size_t i = 0; i < 4 + 5 * population; ++i) {
        names.push_back(own + std::to_string(i));
    }
    return names;
}

std::string membersOf(std::size_t population) {
    return population == 0 ? "ua0,ua1,ua2" : "ub0,ub1,ub2,ub3,ub4";
}

std::string passwdOf(std::size_t population) {
    const std::string letter(1, letterOf(population));
    std::string text;
    std::size_t id = 1000 * (population + 1);
    for (const std::string& name : namesOf(population, "u")) {
        const std::string number = std::to_string(id++);
        text += name + ":x:" + number + ":" + number + ":Population " + letter + ",,,:/home/" +
                letter + "/" + name + ":/bin/" + letter + "\n";
    }
    return text;
}

std::string shadowOf(std::size_t population) {
    const std::string field = population == 0 ? "!hash" : "hash";
    const std::string days = population == 0 ? "11000:1:10:3:5::" : "12000:2:20:6:8:40000:";
    std::string text;
    for (const std::string& name : namesOf(population, "u")) {
        text += name;
        text += ":";
        text += field;
        text += ":";
        text += days;
        text += "\n";
    }
    return text;
}

std::string groupOf(std::size_t population) {
    std::string text;
    std::size_t id = 3000 * (population + 1);
    for (const std::string& name : namesOf(population, "g")) {
        text += name + ":x:" + std::to_string(id++) + ":" + membersOf(population) + "\n";
    }
    return text;
}

std::string contentOf(const std::string& file, std::size_t population) {
    return file == "passwd"   ? passwdOf(population)
           : file == "shadow" ? shadowOf(population)
                              : groupOf(population);
}

void write(const fs::path& file, const std::string& content) {
    std::ofstream stream(file, std::ios::binary | std::ios::trunc);
    stream << content << std::flush;
    if (!stream) {
        throw std::runtime_error("cannot write " + file.native());
    }
}

void replaceFile(const fs::path& file, const std::string& content) {
    const fs::path draft = file.native() + "+";
    write(draft, content);
    fs::rename(draft, file);
}

void replaceLink(const fs::path& link, const std::string& target) {
    const fs::path draft = link.native() + "+";
    fs::create_symlink(target, draft);
    fs::rename(draft, link);
}

std::string nodesOf(std::size_t population) {
    const std::string letter(1, letterOf(population));
    nlohmann::json nodes;
    const auto add = [&nodes](NodeType type, const std::string& path, nlohmann::json properties) {
        nodes.push_back({{"type", type}, {"path", path}, {"properties", std::move(properties)}});
    };
    add(UserAdministration, "/top", nlohmann::json::object());
    for (const std::string& name : namesOf(population, "/s")) {
        add(AccountServiceRoot, name, nlohmann::json::object());
    }
    for (const std::string& name : namesOf(population, "u")) {
        add(UserAccount, "/top/" + name,
            {{std::to_string(Name), name},
             {std::to_string(FullName), "Population " + letter},
             {std::to_string(UserID), "7" + letter},
             {std::to_string(HomeDirectory), "/home/" + letter},
             {std::to_string(DaysExpireAfter), population + 5},
             {std::to_string(PasswordRules), {1, population + 2}}});
    }
    for (const std::string& name : namesOf(population, "g")) {
        add(UserGroup, "/top/" + name,
            {{std::to_string(Name), name}, {std::to_string(GroupMembers), {letter, "x"}}});
    }
    return nlohmann::json{{"nodes", nodes}}.dump();
}

} // namespace

ChangingAccounts::ChangingAccounts(fs::path root) : root_(std::move(root)) {
    for (const char* directory : {"A", "B", "worked-on"}) {
        fs::create_directories(root_ / directory);
    }
    fill("A", 0, 0);
    fill("B", 1, 1);
    show("A");
}

Subjects ChangingAccounts::subjects() const {
    return {"uboth3", "ua0", "gboth3", "gb0", "/AccountServiceRoot/1", "/AccountServiceRoot/2"};
}

void ChangingAccounts::fill(const std::string& directory, std::size_t passwd,
                            std::size_t others) const {
    write(root_ / directory / "passwd", contentOf("passwd", passwd));
    write(root_ / directory / "shadow", contentOf("shadow", others));
    write(root_ / directory / "group", contentOf("group", others));
}

void ChangingAccounts::show(const std::string& directory) { replaceLink(root_ / "etc", directory); }

void ChangingAccounts::replace(const std::string& file, std::size_t population) const {
    replaceFile(root_ / "worked-on" / file, contentOf(file, population));
}

void ChangingAccounts::putState(std::size_t state) {
    // The states between have the accounts of the one and the rest of the other.
    const std::size_t passwd = state % 2;
    const std::size_t others = state < 2 ? passwd : 1 - passwd;
    const std::string directory = "state" + std::to_string(state);
    fs::create_directories(root_ / directory);
    fill(directory, passwd, others);
    show(directory);
}

void ChangingAccounts::change(std::uint64_t turn) {
    const std::size_t wanted = turn % 2;
    if (turn / 2 % 2 == 0) {
        show(wanted == 0 ? "A" : "B");
        return;
    }
    // Before the first of two turns in this way: the population that is there, from the files
    // that are going to be replaced.
    if (wanted == 0) {
        for (const char* file : {"passwd", "shadow", "group"}) {
            replace(file, 1 - wanted);
        }
        show("worked-on");
    }
    // Now and then so slowly that what is read in between seems to have settled.
    const std::chrono::milliseconds pause(turn % 8 >= 6 ? 100 : 0);
    for (const char* file : {"passwd", "shadow", "group"}) {
        replace(file, wanted);
        std::this_thread::sleep_for(pause);
    }
}

ChangingNodeFile::ChangingNodeFile(fs::path directory)
    : directory_(std::move(directory)), file_(directory_ / "nodes") {
    fs::create_directories(directory_);
    for (const std::size_t population : {0U, 1U}) {
        write(directory_ / std::string(1, letterOf(population)), nodesOf(population));
    }
    putState(0);
}

Subjects ChangingNodeFile::subjects() const {
    return {"uboth3", "ua0", "gboth3", "gb0", "/sboth3", "/sa0"};
}

void ChangingNodeFile::putState(std::size_t state) { replaceFile(file_, nodesOf(state)); }

void ChangingNodeFile::change(std::uint64_t turn) {
    const std::size_t population = turn % 2;
    if (turn / 2 % 2 == 0) {
        replaceLink(file_, std::string(1, letterOf(population)));
    } else {
        replaceFile(file_, nodesOf(population));
    }
}

} // namespace qelo::test
