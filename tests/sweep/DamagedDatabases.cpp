#include "DamagedDatabases.h"

#include <algorithm>
#include <functional>
#include <random>

namespace qelo::test {

namespace {

using Files = std::map<std::string, std::string>;
using Fields = std::vector<std::string>;
using Place = DamagedDatabase::Place;

constexpr std::size_t kHuge = 300'000;

// The lines of the victim, by file.
const std::map<std::string, Fields>& victims() {
    static const std::map<std::string, Fields> lines = {
        {"passwd", {"victim", "x", "1001", "1001", "Victim,Room 7,,", "/home/victim", "/bin/sh"}},
        {"shadow", {"victim", "$y$j9T$salt$hash", "19000", "0", "99999", "7", "30", "25000", ""}},
        {"group", {"victim", "x", "1001", "first,last"}},
        {"gshadow", {"victim", "!", "first", "first,last"}}};
    return lines;
}

const std::map<std::string, std::pair<std::string, std::string>>& frames() {
    static const std::map<std::string, std::pair<std::string, std::string>> lines = {
        {"passwd",
         {"first:x:1000:1000:First:/home/first:/bin/bash\n",
          "last:x:1002:1002:Last:/home/last:/bin/zsh\n"}},
        {"shadow", {"first:*:19000:0:99999:7:::\n", "last:!:19000:0:99999:7:::\n"}},
        {"group", {"first:x:1000:\n", "last:x:1002:first\n"}},
        {"gshadow", {"first:!::\n", "last:!::first\n"}}};
    return lines;
}

std::string joined(const Fields& fields) {
    std::string line;
    for (std::size_t i = 0; i < fields.size(); ++i) {
        line += (i == 0 ? "" : ":") + fields[i];
    }
    return line;
}

// The files with that text where the victim's line of one of them is.
Files filesWith(const std::string& file, const std::string& between) {
    Files files;
    for (const auto& [name, frame] : frames()) {
        const std::string line = name == file ? between : joined(victims().at(name)) + "\n";
        files[name] = frame.first + line + frame.second;
    }
    return files;
}

Files undamaged() { return filesWith("", ""); }

// What a field of the victim may hold, with a word for each.
std::vector<std::pair<std::string, std::string>> badValues() {
    return {{"empty", ""},
            {"huge", std::string(kHuge, 'x')},
            {"huge number", std::string(400, '9')},
            {"negative", "-1"},
            {"past 32 bits", "4294967296"},
            {"no id", "4294967295"},
            {"past 64 bits", "18446744073709551616"},
            {"hexadecimal", "0x10"},
            {"fraction", "1.5"},
            {"blank", "   "},
            {"tab", "\t1\t"},
            {"binary", std::string("\x00\x01\x02\xFF\xFE\x7F", 6)},
            {"not UTF-8", "\xC3\x28\xA0\xA1"},
            {"overlong UTF-8", "\xC0\xAF"},
            {"surrogate", "\xED\xA0\x80"},
            {"carriage return", "1\r"},
            {"formats", "%s%n%d%99999d"},
            {"markup", "<a href=\"x\">&amp;</a>"},
            {"commas", std::string(5000, ',')},
            {"the same name over and over", [] {
                 std::string names = "first";
                 for (int i = 0; i < 2000; ++i) {
                     names += ",first";
                 }
                 return names;
             }()}};
}

void addFields(std::vector<DamagedDatabase>& all) {
    for (const auto& [file, fields] : victims()) {
        for (std::size_t i = 0; i < fields.size(); ++i) {
            for (const auto& [word, value] : badValues()) {
                Fields damaged = fields;
                damaged[i] = value;
                all.push_back({file + ", field " + std::to_string(i) + ", " + word,
                               filesWith(file, joined(damaged) + "\n")});
            }
        }
    }
}

// Lines that are no proper line at all.
void addLines(std::vector<DamagedDatabase>& all) {
    for (const auto& [file, fields] : victims()) {
        const std::string line = joined(fields);
        const std::vector<std::pair<std::string, std::string>> damages = {
            {"line is missing", ""},
            {"line is empty", "\n"},
            {"line is there twice", line + "\n" + line + "\n"},
            {"line is there a thousand times",
             [&] {
                 std::string lines;
                 for (int i = 0; i < 1000; ++i) {
                     lines += line + "\n";
                 }
                 return lines;
             }()},
            {"line has a field too many", line + ":more\n"},
            {"line has a thousand fields too many", line + std::string(1000, ':') + "\n"},
            {"line ends in CR", line + "\r\n"},
            {"line is a comment", "#" + line + "\n"},
            {"line begins with a blank", " " + line + "\n"},
            {"line brings in a network", "+::::::\n+" + line + "\n-" + line + "\n+@group\n"},
            {"line is colons", ":::::::::::::\n"},
            {"line is binary", std::string(1000, '\xFF') + std::string(1000, '\0') + "\n"},
            {"line is huge", std::string(kHuge, ':') + "\n"},
            {"name is first's", "first" + line.substr(line.find(':')) + "\n"}};
        for (const auto& [word, between] : damages) {
            all.push_back({file + ", " + word, filesWith(file, between)});
        }
        for (std::size_t length = 1; length < line.size(); length += 3) {
            all.push_back({file + ", line ends after " + std::to_string(length) + " bytes",
                           filesWith(file, line.substr(0, length) + "\n")});
        }
    }
}

// Without that file, nothing that is read from it can be asked for.
void loseAll(DamagedDatabase& database, const std::string& file) {
    if (file == "passwd") {
        database.firstAccount = database.lastAccount = false;
    } else if (file == "group") {
        database.firstGroup = database.lastGroup = false;
    }
}

void loseLast(DamagedDatabase& database, const std::string& file) {
    database.lastAccount = database.lastAccount && file != "passwd";
    database.lastGroup = database.lastGroup && file != "group";
}

void addWhole(std::vector<DamagedDatabase>& all, const std::string& file, const std::string& word,
              const std::function<void(std::string&)>& damage, bool readable) {
    DamagedDatabase database{file + " " + word, undamaged()};
    damage(database.files[file]);
    if (!readable) {
        loseAll(database, file);
    }
    all.push_back(database);
}

void addPlaces(std::vector<DamagedDatabase>& all, const std::string& file) {
    for (const Place place :
         {Place::Directory, Place::Pipe, Place::LoopingLink, Place::Unreadable}) {
        DamagedDatabase database{file + " is of kind " + std::to_string(static_cast<int>(place)),
                                 undamaged()};
        database.place = place;
        database.placeOf = file;
        database.files.erase(file);
        loseAll(database, file);
        all.push_back(database);
    }
}

std::string withCarriageReturns(const std::string& text) {
    std::string result;
    for (const char c : text) {
        result += c == '\n' ? "\r\n" : std::string(1, c);
    }
    return result;
}

void addFiles(std::vector<DamagedDatabase>& all) {
    for (const auto& [file, fields] : victims()) {
        DamagedDatabase missing{file + " is missing", undamaged()};
        missing.files.erase(file);
        loseAll(missing, file);
        all.push_back(missing);
        addPlaces(all, file);
        addWhole(
            all, file, "is empty", [](auto& text) { text.clear(); }, false);
        addWhole(
            all, file, "has no final newline", [](auto& text) { text.pop_back(); }, true);
        addWhole(
            all, file, "has CRLF", [](auto& text) { text = withCarriageReturns(text); }, true);
        addWhole(
            all, file, "is CR alone",
            [](auto& text) { std::replace(text.begin(), text.end(), '\n', '\r'); }, false);
        addWhole(
            all, file, "ends in zeros", [](auto& text) { text.append(5000, '\0'); }, true);
        addWhole(
            all, file, "is zeros", [](auto& text) { text.assign(5000, '\0'); }, false);
        addWhole(
            all, file, "is newlines", [](auto& text) { text.assign(5000, '\n'); }, false);
        addWhole(
            all, file, "begins with empty lines", [](auto& text) { text.insert(0, 1000, '\n'); },
            true);
        const std::size_t size = undamaged().at(file).size();
        for (std::size_t length = 1; length < size; length += 7) {
            DamagedDatabase cut{file + " is cut after " + std::to_string(length) + " bytes",
                                undamaged()};
            cut.files[file].resize(length);
            loseLast(cut, file);
            if (length < frames().at(file).first.size()) {
                loseAll(cut, file);
            }
            all.push_back(cut);
        }
    }
}

// ---- At random

using Random = std::mt19937;

std::size_t below(Random& random, std::size_t bound) { return random() % bound; }

char anyByte(Random& random) {
    static const std::string favourites(":\n,:\n\0\r+-#!*0129 \xFF\xC3", 19);
    return below(random, 2) == 0 ? favourites[below(random, favourites.size())]
                                 : static_cast<char>(random() & 0xFFU);
}

void damageOnce(Random& random, std::string& text) {
    const std::size_t at = below(random, text.size() + 1);
    const std::size_t length = std::min(below(random, 20), text.size() - at);
    switch (below(random, 5)) {
    case 0:
        text.erase(at, length);
        break;
    case 1:
        text.insert(at, 1, anyByte(random));
        break;
    case 2:
        text.insert(below(random, text.size() + 1), text.substr(at, length));
        break;
    case 3:
        text.insert(at, below(random, 3000), anyByte(random));
        break;
    default:
        if (at < text.size()) {
            text[at] = anyByte(random);
        }
        break;
    }
}

void damage(Random& random, std::string& text) {
    for (std::size_t count = 1 + below(random, 8); count > 0; --count) {
        damageOnce(random, text);
    }
}

} // namespace

std::vector<DamagedDatabase> damagedDatabases() {
    std::vector<DamagedDatabase> all;
    addFields(all);
    addLines(all);
    addFiles(all);
    return all;
}

DamagedDatabase randomlyDamaged(std::uint32_t seed) {
    Random random(seed);
    DamagedDatabase database{"seed " + std::to_string(seed), {}};
    const bool whole = below(random, 3) == 0;
    for (const auto& [file, frame] : frames()) {
        std::string line = joined(victims().at(file)) + "\n";
        if (!whole) {
            damage(random, line);
            database.files[file] = frame.first + line + "\n" + frame.second;
        } else {
            database.files[file] = frame.first + line + frame.second;
            damage(random, database.files[file]);
        }
    }
    database.firstAccount = database.lastAccount = !whole;
    database.firstGroup = database.lastGroup = !whole;
    return database;
}

} // namespace qelo::test
