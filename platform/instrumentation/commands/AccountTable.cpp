#include "AccountTable.h"

#include "AccountFileLock.h"
#include "FileText.h"

#include <cerrno>

namespace qelo::store {

namespace {

constexpr std::chrono::seconds kLockLimit{30};

bool isMissing(const RootDirectory& root, FileSystem& files, const char* name) {
    struct stat status {};
    return !files.statusAt(root.etc(), name, status) && errno == ENOENT;
}

std::string joinLines(const Lines& lines) {
    std::string text;
    for (const std::string& line : lines) {
        text += line;
        text += '\n';
    }
    return text;
}

} // namespace

Fields splitFields(std::string_view text, char separator) {
    Fields fields;
    while (true) {
        const std::size_t end = text.find(separator);
        fields.emplace_back(text.substr(0, end));
        if (end == std::string_view::npos) {
            return fields;
        }
        text.remove_prefix(end + 1);
    }
}

std::string joinFields(const Fields& fields, char separator) {
    std::string text;
    for (const std::string& field : fields) {
        if (&field != &fields.front()) {
            text += separator;
        }
        text += field;
    }
    return text;
}

std::string_view keyOf(std::string_view line) { return line.substr(0, line.find(':')); }

Attempt<Lines> readLines(const RootDirectory& root, FileSystem& files, const char* name) {
    if (isMissing(root, files, name)) {
        return Lines{};
    }
    const Attempt<std::string> text = readSmallFile(files, root.etc(), name);
    if (!text) {
        return text.refusal();
    }
    Lines lines = splitFields(*text, '\n');
    if (lines.back().empty()) {
        lines.pop_back();
    }
    return lines;
}

Problem editLines(const RootDirectory& root, FileSystem& files, const char* name,
                  const LineEdit& edit) {
    if (isMissing(root, files, name)) {
        return {};
    }
    const Attempt<AccountFileLock> lock = AccountFileLock::take(root, files, name, kLockLimit);
    if (!lock) {
        return lock.reason();
    }
    Attempt<Lines> lines = readLines(root, files, name);
    if (!lines) {
        return lines.reason();
    }
    return edit(*lines) ? replaceFile(files, root.etc(), name, joinLines(*lines)) : Problem();
}

} // namespace qelo::store
