#include "PolicyFiles.h"

#include <algorithm>

namespace qelo::nodes {

namespace {

bool isConfigName(const std::string& name) {
    constexpr std::string_view ending = ".conf";
    return name.size() > ending.size() && name.front() != '.' &&
           name.compare(name.size() - ending.size(), ending.size(), ending) == 0;
}

std::vector<Setting> readSettingsFile(SnapshotBuilder& builder, const std::string& name) {
    std::vector<Setting> settings;
    builder.readFile(name, Presence::optional, [&](std::string& text, Damage& damage) {
        settings = readSettings(text);
        for (const Setting& setting : settings) {
            if (!PolicyReader::isReadable(setting)) {
                damage.add(setting.line, "not a number");
            }
        }
    });
    return settings;
}

} // namespace

PasswordPolicy readPolicy(SnapshotBuilder& builder) {
    const std::string directory = "etc/security/";
    PolicyReader reader;
    reader.readFaillock(readSettingsFile(builder, directory + "faillock.conf"));
    reader.readHistory(readSettingsFile(builder, directory + "pwhistory.conf"));
    for (const std::string& name : builder.list(directory + "pwquality.conf.d")) {
        if (isConfigName(name)) {
            std::string path = directory;
            path.append("pwquality.conf.d/").append(name);
            reader.readQuality(readSettingsFile(builder, path));
        }
    }
    reader.readQuality(readSettingsFile(builder, directory + "pwquality.conf"));
    builder.readFile(
        "etc/pam.d/common-password", Presence::optional,
        [&](std::string& text, Damage&) { reader.readModules(readPasswordModules(text)); });
    return reader.policy();
}

} // namespace qelo::nodes
