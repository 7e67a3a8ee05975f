#include "RootSettings.h"

#include "AccountTable.h"
#include "FileText.h"

#include <cerrno>
#include <charconv>
#include <fcntl.h>
#include <optional>
#include <strings.h>

namespace qelo::store {

namespace {

constexpr unsigned kAllPermissions = 0777;

// The value of the last line "KEY VALUE" or "KEY=VALUE".
std::optional<std::string> valueOf(const std::string& text, const std::string& key) {
    std::optional<std::string> value;
    for (const std::string& line : splitFields(text, '\n')) {
        const std::size_t start = line.find_first_not_of(" \t");
        if (start == std::string::npos || line.compare(start, key.size(), key) != 0) {
            continue;
        }
        const std::size_t end = start + key.size();
        const std::size_t from = line.find_first_not_of(" \t\r=", end);
        if (from != std::string::npos && from != end) {
            value = line.substr(from, line.find_last_not_of(" \t\r") + 1 - from);
        }
    }
    return value;
}

std::optional<unsigned> octalOf(const std::string& text, const std::string& key) {
    const std::optional<std::string> value = valueOf(text, key);
    unsigned number = 0;
    if (!value) {
        return {};
    }
    const auto end = value->data() + value->size();
    const auto read = std::from_chars(value->data(), end, number, 8);
    return read.ec == std::errc() && read.ptr == end ? std::optional(number & kAllPermissions)
                                                     : std::nullopt;
}

void readLoginDefs(const std::string& text, RootSettings& settings) {
    const std::optional<std::string> create = valueOf(text, "CREATE_HOME");
    settings.createHome = create && ::strcasecmp(create->c_str(), "yes") == 0;
    if (const std::optional<unsigned> umask = octalOf(text, "UMASK")) {
        settings.homeMode = kAllPermissions & ~*umask;
    }
    if (const std::optional<unsigned> mode = octalOf(text, "HOME_MODE")) {
        settings.homeMode = *mode;
    }
    settings.mailDirectory = valueOf(text, "MAIL_DIR").value_or(settings.mailDirectory);
}

// The text of a file; empty when there is none.
Attempt<std::string> readIfThere(FileSystem& files, int directory, const std::string& name) {
    struct stat status {};
    const bool missing = !files.statusAt(directory, name, status) && errno == ENOENT;
    return missing ? Attempt<std::string>(std::string()) : readSmallFile(files, directory, name);
}

// The text of etc/default/useradd; empty when there is none.
Attempt<std::string> readUseraddDefaults(const Workplace& workplace) {
    const Descriptor directory =
        workplace.files.open(workplace.root.etc(), "default", O_RDONLY | O_DIRECTORY);
    if (directory) {
        return readIfThere(workplace.files, directory.get(), "useradd");
    }
    return errno == ENOENT ? Attempt<std::string>(std::string())
                           : Refusal{"cannot open etc/default"};
}

} // namespace

Attempt<RootSettings> readRootSettings(const Workplace& workplace) {
    const Attempt<std::string> loginDefs =
        readIfThere(workplace.files, workplace.root.etc(), "login.defs");
    if (!loginDefs) {
        return loginDefs.refusal();
    }
    const Attempt<std::string> defaults = readUseraddDefaults(workplace);
    if (!defaults) {
        return defaults.refusal();
    }
    RootSettings settings;
    readLoginDefs(*loginDefs, settings);
    settings.skeleton = valueOf(*defaults, "SKEL").value_or(settings.skeleton);
    return settings;
}

} // namespace qelo::store
