#include "HalfDone.h"

#include <algorithm>
#include <set>
#include <sstream>

namespace qelo::test {

namespace {

namespace fs = std::filesystem;

using Lines = std::vector<std::string>;
using Counts = std::map<std::string, long>;

const Counts& fieldsOfFiles() {
    static const Counts fields = {{"passwd", 7},  {"shadow", 9}, {"group", 4},
                                  {"gshadow", 4}, {"subuid", 3}, {"subgid", 3}};
    return fields;
}

Lines linesIn(const std::string& text) {
    Lines lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

Counts countsOf(const Lines& lines) {
    Counts counts;
    for (const std::string& line : lines) {
        ++counts[line];
    }
    return counts;
}

Counts namesIn(const Lines& lines) {
    Counts names;
    for (const std::string& line : lines) {
        ++names[line.substr(0, line.find(':'))];
    }
    return names;
}

// A file as a state describes it: mode and owner on a line of their own, then its content.
struct Described {
    explicit Described(const std::string& text)
        : kind(text.substr(0, text.find('\n'))), whole(text.back() == '\n'),
          lines(linesIn(text.substr(kind.size() + 1))) {}

    const std::string kind;
    const bool whole;
    const Lines lines;
};

class Losses {
public:
    Lines find(const RootState& now, const RootState& before, const RootState& after) {
        for (const auto& [file, fields] : fieldsOfFiles()) {
            const std::string path = "etc/" + file;
            if (now.count(path) == 0) {
                losses_.push_back("no file " + file);
                continue;
            }
            file_ = file;
            const Described description(now.at(path));
            checkForm(description, fields);
            compare(description, Described(before.at(path)), Described(after.at(path)));
        }
        return losses_;
    }

private:
    void expect(bool holds, const std::string& loss) {
        if (!holds) {
            losses_.push_back(file_ + ": " + loss);
        }
    }

    void checkForm(const Described& file, long fields) {
        expect(file.whole, "no newline at the end");
        for (const std::string& line : file.lines) {
            expect(std::count(line.begin(), line.end(), ':') + 1 == fields, "malformed: " + line);
        }
    }

    void compare(const Described& now, const Described& before, const Described& after) {
        expect(now.kind == before.kind, "another mode or owner: " + now.kind);
        const Counts lines = countsOf(now.lines);
        const Counts stay = countsOf(after.lines);
        for (const std::string& line : before.lines) {
            const auto found = lines.find(line);
            expect(stay.count(line) == 0 || (found != lines.end() && found->second == 1),
                   "not there once: " + line);
        }
        compareNames(namesIn(now.lines), namesIn(before.lines), namesIn(after.lines));
    }

    void compareNames(const Counts& now, const Counts& before, const Counts& after) {
        for (const auto& [name, count] : before) {
            expect(after.count(name) == 0 || now.count(name) == 1, "gone: " + name);
        }
        for (const auto& [name, count] : now) {
            expect(count == 1, "there twice: " + name);
            expect(before.count(name) + after.count(name) != 0, "of neither state: " + name);
        }
    }

    std::string file_;
    Lines losses_;
};

} // namespace

std::vector<std::string> findLosses(const RootState& now, const RootState& before,
                                    const RootState& after) {
    return Losses().find(now, before, after);
}

std::vector<std::string> findRests(const fs::path& root) {
    static const std::set<std::string> others{"login.defs", "default", "skel", ".qelosim.lock",
                                              ".pwd.lock"};
    std::vector<std::string> rests;
    for (const auto& entry : fs::directory_iterator(root / "etc")) {
        const std::string name = entry.path().filename().string();
        const std::string file = name.back() == '-' ? name.substr(0, name.size() - 1) : name;
        if (others.count(name) == 0 && fieldsOfFiles().count(file) == 0) {
            rests.push_back(name);
        }
    }
    return rests;
}

} // namespace qelo::test
