#include "SampleDatabase.h"

#include <algorithm>

namespace qelo::test {

namespace {

constexpr const char* kBlanks = " \t\r\v\f";

// The name of a line as the C library's readers see it.
std::string nameIn(const std::string& line) {
    const std::size_t start = line.find_first_not_of(kBlanks);
    const std::string_view ends(":\0", 2);
    return start == std::string::npos ? std::string()
                                      : line.substr(start, line.find_first_of(ends, start) - start);
}

Fields linesOf(const std::string& text) {
    Fields lines{""};
    for (const char c : text) {
        if (c == '\n') {
            lines.emplace_back();
        } else {
            lines.back() += c;
        }
    }
    return lines;
}

} // namespace

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

Files filesWith(const std::string& file, const std::string& between) {
    Files files = policyFiles();
    for (const auto& [name, frame] : frames()) {
        const std::string line = name == file ? between : joined(victims().at(name)) + "\n";
        files[name] = frame.first + line + frame.second;
    }
    return files;
}

Files undamagedFiles() { return filesWith("", ""); }

const Files& policyFiles() {
    static const Files files = {
        {kFaillock, "# what a comment says\ndeny = 5\n"},
        {kPwhistory, "remember = 7\n"},
        {kPwquality, "minlen = 12\ndcredit = -1\n"},
        {kCommonPassword, "password requisite pam_pwquality.so retry=3 ucredit=-1\n"
                          "password [success=1 default=ignore] pam_unix.so obscure remember=3\n"}};
    return files;
}

LineState stateOfLine(const Files& files, const std::string& file, const std::string& name) {
    const auto found = files.find(file);
    if (found == files.end()) {
        return LineState::Missing;
    }
    const auto& [first, last] = frames().at(file);
    const std::string whole = name == "first" ? first : last;
    std::size_t same = 0;
    std::size_t named = 0;
    for (const std::string& line : linesOf(found->second)) {
        same += line + "\n" == whole ? 1 : 0;
        named += nameIn(line) == name ? 1 : 0;
    }
    if (named == 0) {
        return LineState::Missing;
    }
    return same == 1 && named == 1 ? LineState::Whole : LineState::Unclear;
}

} // namespace qelo::test
