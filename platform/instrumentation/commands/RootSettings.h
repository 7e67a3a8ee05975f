// Settings of the root directory's own configuration files that no tool applies for us.
#pragma once

#include "Attempt.h"
#include "Workplace.h"

#include <string>

namespace qelo::store {

struct RootSettings {
    // Whether new accounts get a home directory when nothing is said about it
    // (CREATE_HOME in login.defs).
    bool createHome = false;
    // Of new home directories (HOME_MODE, else what UMASK leaves).
    mode_t homeMode = 0755;
    // Where their first content is copied from (SKEL in default/useradd).
    std::string skeleton = "/etc/skel";
    // Where useradd makes a mail file when CREATE_MAIL_SPOOL tells it to (MAIL_DIR).
    std::string mailDirectory = "/var/mail";
};

// Reads etc/login.defs and etc/default/useradd. What is missing has its default; a file that is
// there but cannot be read is a refusal, since the default may give away more than it says.
Attempt<RootSettings> readRootSettings(const Workplace& workplace);

} // namespace qelo::store
