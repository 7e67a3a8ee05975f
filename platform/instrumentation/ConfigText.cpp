#include "ConfigText.h"

#include <charconv>

namespace qelo::nodes {

namespace {

constexpr std::string_view blanks = " \t\r\v\f";

std::string_view trim(std::string_view text) {
    const auto begin = text.find_first_not_of(blanks);
    if (begin == std::string_view::npos) {
        return {};
    }
    return text.substr(begin, text.find_last_not_of(blanks) - begin + 1);
}

std::string_view takeLine(std::string_view& text) {
    const auto end = text.find('\n');
    const std::string_view line = text.substr(0, end);
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
    return line;
}

std::string_view withoutComment(std::string_view line) { return line.substr(0, line.find('#')); }

Setting settingOf(std::string_view text, std::size_t line) {
    const auto equals = text.find('=');
    if (equals == std::string_view::npos) {
        return {std::string(trim(text)), {}, line};
    }
    return {std::string(trim(text.substr(0, equals))), std::string(trim(text.substr(equals + 1))),
            line};
}

// A line, joined with those that it continues on by a backslash at its end.
std::string takeJoinedLine(std::string_view& text) {
    std::string joined;
    bool continues = true;
    while (continues && !text.empty()) {
        std::string_view line = withoutComment(takeLine(text));
        continues = !line.empty() && line.back() == '\\';
        if (continues) {
            line.remove_suffix(1);
        }
        joined.append(line).append(continues ? " " : "");
    }
    return joined;
}

// A word, or a bracketed list as one word without its brackets.
std::string_view takeWord(std::string_view& line) {
    line = trim(line);
    const bool bracketed = !line.empty() && line.front() == '[';
    if (bracketed) {
        line.remove_prefix(1);
    }
    const auto end = bracketed ? line.find(']') : line.find_first_of(blanks);
    const std::string_view word = line.substr(0, end);
    line.remove_prefix(end == std::string_view::npos ? line.size() : end + 1);
    return word;
}

bool isPasswordType(std::string_view word) { return word == "password" || word == "-password"; }

std::string_view baseName(std::string_view path) {
    const auto slash = path.rfind('/');
    return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

} // namespace

std::vector<Setting> readSettings(std::string_view text) {
    std::vector<Setting> settings;
    for (std::size_t number = 1; !text.empty(); ++number) {
        const std::string_view line = trim(withoutComment(takeLine(text)));
        if (!line.empty()) {
            settings.push_back(settingOf(line, number));
        }
    }
    return settings;
}

std::vector<PasswordModule> readPasswordModules(std::string_view text) {
    std::vector<PasswordModule> modules;
    while (!text.empty()) {
        const std::string joined = takeJoinedLine(text);
        std::string_view line = joined;
        if (!isPasswordType(takeWord(line))) {
            continue;
        }
        takeWord(line); // the control field
        PasswordModule module{std::string(baseName(takeWord(line))), {}};
        while (!trim(line).empty()) {
            module.arguments.push_back(settingOf(takeWord(line), 0));
        }
        modules.push_back(std::move(module));
    }
    return modules;
}

std::optional<std::int64_t> wholeNumber(std::string_view text) {
    std::int64_t number = 0;
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, number);
    if (text.empty() || result.ec != std::errc() || result.ptr != end) {
        return std::nullopt;
    }
    return number;
}

} // namespace qelo::nodes
