#include "DamagedDatabases.h"

#include <algorithm>
#include <functional>

namespace qelo::test {

namespace {

using Place = DamagedDatabase::Place;

constexpr std::size_t kHuge = 300'000;

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
            {"the first's name", "first"},
            {"the last's name", "last"},
            {"the first's number", "1000"},
            {"the last's number", "1002"},
            {"commas", std::string(5000, ',')},
            {"the same name over and over", [] {
                 std::string names = "first";
                 for (int i = 0; i < 2000; ++i) {
                     names += ",first";
                 }
                 return names;
             }()}};
}

// What the rules of a file are told by.
std::set<std::string> propertiesOf(const std::string& file) {
    const std::string history = "PasswordHistoryDepth";
    const std::string rules = "ComplexPasswordRulesEnforced";
    if (file == kFaillock) {
        return {"MaximumSuccessiveLoginFailures"};
    }
    if (file == kPwhistory) {
        return {history};
    }
    if (file == kPwquality) {
        return {rules};
    }
    return file == kCommonPassword ? std::set<std::string>{history, rules}
                                   : std::set<std::string>{};
}

DamagedDatabase& add(std::vector<DamagedDatabase>& all, const std::string& file,
                     const std::string& word, const Files& files) {
    all.push_back({file + ", " + word, files});
    all.back().open = propertiesOf(file);
    all.back().isRead = file != "gshadow";
    return all.back();
}

void addFields(std::vector<DamagedDatabase>& all) {
    for (const auto& [file, fields] : victims()) {
        for (std::size_t i = 0; i < fields.size(); ++i) {
            for (const auto& [word, value] : badValues()) {
                Fields damaged = fields;
                damaged[i] = value;
                add(all, file, "field " + std::to_string(i) + ", " + word,
                    filesWith(file, joined(damaged) + "\n"));
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
            add(all, file, word, filesWith(file, between));
        }
        for (std::size_t length = 1; length < line.size(); length += 3) {
            add(all, file, "line ends after " + std::to_string(length) + " bytes",
                filesWith(file, line.substr(0, length) + "\n"));
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
    DamagedDatabase& database = add(all, file, word, undamagedFiles());
    damage(database.files[file]);
    if (!readable) {
        loseAll(database, file);
    }
}

void addPlaces(std::vector<DamagedDatabase>& all, const std::string& file) {
    for (const Place place :
         {Place::Directory, Place::Pipe, Place::LoopingLink, Place::Unreadable}) {
        DamagedDatabase& database = add(
            all, file, "is of kind " + std::to_string(static_cast<int>(place)), undamagedFiles());
        database.place = place;
        database.placeOf = file;
        database.files.erase(file);
        loseAll(database, file);
    }
}

std::string withCarriageReturns(const std::string& text) {
    std::string result;
    for (const char c : text) {
        result += c == '\n' ? "\r\n" : std::string(1, c);
    }
    return result;
}

void addWholes(std::vector<DamagedDatabase>& all, const std::string& file) {
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
        all, file, "begins with empty lines", [](auto& text) { text.insert(0, 1000, '\n'); }, true);
}

void addMissing(std::vector<DamagedDatabase>& all, const std::string& file) {
    DamagedDatabase& missing = add(all, file, "is missing", undamagedFiles());
    missing.files.erase(file);
    loseAll(missing, file);
}

void addCuts(std::vector<DamagedDatabase>& all, const std::string& file) {
    const std::size_t size = undamagedFiles().at(file).size();
    for (std::size_t length = 1; length < size; length += 7) {
        DamagedDatabase& cut =
            add(all, file, "is cut after " + std::to_string(length) + " bytes", undamagedFiles());
        cut.files[file].resize(length);
        loseLast(cut, file);
        if (victims().count(file) != 0 && length < frames().at(file).first.size()) {
            loseAll(cut, file);
        }
    }
}

void addFiles(std::vector<DamagedDatabase>& all) {
    for (const auto& [file, content] : undamagedFiles()) {
        addMissing(all, file);
        addPlaces(all, file);
        addWholes(all, file);
        addCuts(all, file);
    }
}

// Settings of other values, twice, and in lines that are none.
void addSettings(std::vector<DamagedDatabase>& all) {
    for (const auto& [file, content] : policyFiles()) {
        const std::size_t begin = content.rfind('=') + 1;
        for (const auto& [word, value] : badValues()) {
            Files files = undamagedFiles();
            files[file] = content.substr(0, begin) + value + "\n" + content;
            add(all, file, "a setting of another value: " + word, files);
            files[file] = value + "\n" + value + "=" + value + "\n" + content;
            add(all, file, "lines before it: " + word, files);
            files[file] = content + "=" + value + "\n= " + value + " \\\n#" + value + "\n[" + value;
            add(all, file, "lines after it: " + word, files);
        }
    }
}

} // namespace

std::vector<DamagedDatabase> damagedDatabases() {
    std::vector<DamagedDatabase> all;
    addFields(all);
    addLines(all);
    addFiles(all);
    addSettings(all);
    return all;
}

} // namespace qelo::test
