#include "ScratchRoot.h"

#include "Attempt.h"
#include "FileSystem.h"
#include "FileText.h"
#include "Tree.h"

#include <array>
#include <cerrno>
#include <fcntl.h>
#include <sys/file.h>

namespace qelo::store {

namespace {

constexpr const char* kDraft = ".etc.qelosim";
constexpr int kOpenDirectory = O_RDONLY | O_DIRECTORY;

struct FirstFile {
    const char* name;
    mode_t mode;
    const char* text;
};

// Neither account has a password that could be entered.
constexpr std::array<FirstFile, 7> kFiles{
    {{"passwd", 0644,
      "root:x:0:0:root:/root:/bin/bash\n"
      "nobody:x:65534:65534:nobody:/nonexistent:/usr/sbin/nologin\n"},
     {"shadow", 0640,
      "root:*:19000:0:99999:7:::\n"
      "nobody:*:19000:0:99999:7:::\n"},
     {"group", 0644,
      "root:x:0:\n"
      "users:x:100:\n"
      "nogroup:x:65534:\n"},
     {"gshadow", 0640,
      "root:*::\n"
      "users:*::\n"
      "nogroup:*::\n"},
     {"subuid", 0644, ""},
     {"subgid", 0644, ""},
     {"login.defs", 0644,
      "# Settings of the account tools for this root directory.\n"
      "UID_MIN 1000\n"
      "UID_MAX 60000\n"
      "GID_MIN 1000\n"
      "GID_MAX 60000\n"
      "SUB_UID_MIN 100000\n"
      "SUB_UID_MAX 600100000\n"
      "SUB_UID_COUNT 65536\n"
      "SUB_GID_MIN 100000\n"
      "SUB_GID_MAX 600100000\n"
      "SUB_GID_COUNT 65536\n"
      "PASS_MIN_DAYS 0\n"
      "PASS_MAX_DAYS 99999\n"
      "PASS_WARN_AGE 7\n"
      "UMASK 022\n"
      "HOME_MODE 0700\n"
      "USERGROUPS_ENAB yes\n"
      "ENCRYPT_METHOD YESCRYPT\n"}}};

constexpr FirstFile kUseraddDefaults{"useradd", 0644,
                                     "SHELL=/bin/bash\n"
                                     "HOME=/home\n"
                                     "SKEL=/etc/skel\n"
                                     "CREATE_MAIL_SPOOL=no\n"};

constexpr FirstFile kFirstProfile{".profile", 0644, "# Read by login shells.\n"};

Problem cannotMake(const std::string& name) { return "cannot make " + name; }

// Makes a directory of just this mode and opens it.
Descriptor makeAndOpen(FileSystem& files, int parent, const std::string& name) {
    Descriptor directory;
    if (files.makeDirectory(parent, name, 0755)) {
        directory = files.open(parent, name, kOpenDirectory);
    }
    if (directory && !files.changeMode(directory.get(), 0755)) {
        directory.reset();
    }
    return directory;
}

Problem writeFirst(FileSystem& files, int directory, const FirstFile& file) {
    return writeNewFile(files, directory, file.name, file.text, file.mode);
}

Problem writeInOwnDirectory(FileSystem& files, int parent, const std::string& name,
                            const FirstFile& file) {
    const Descriptor directory = makeAndOpen(files, parent, name);
    return directory ? writeFirst(files, directory.get(), file) : cannotMake(name);
}

Problem fillEtc(FileSystem& files, int etc) {
    for (const FirstFile& file : kFiles) {
        if (Problem problem = writeFirst(files, etc, file)) {
            return problem;
        }
    }
    if (Problem problem = writeInOwnDirectory(files, etc, "default", kUseraddDefaults)) {
        return problem;
    }
    return writeInOwnDirectory(files, etc, "skel", kFirstProfile);
}

// Whether there is nothing at `name`, or an empty directory.
bool isFree(FileSystem& files, int parent, const std::string& name) {
    const Descriptor directory = files.open(parent, name, kOpenDirectory);
    if (!directory) {
        return errno == ENOENT;
    }
    std::vector<std::string> names;
    return files.list(directory.get(), names) && names.empty();
}

// Makes the directory in which etc comes into being. One that is there was left by a process
// that was killed, as the top directory is locked.
Descriptor makeDraft(FileSystem& files, int top) {
    Descriptor draft = makeAndOpen(files, top, kDraft);
    bool removed = false;
    if (!draft && errno == EEXIST && !removeTree(files, top, kDraft, removed)) {
        draft = makeAndOpen(files, top, kDraft);
    }
    return draft;
}

Problem makeEtc(FileSystem& files, int top) {
    bool removed = false;
    Problem problem = cannotMake("etc");
    if (const Descriptor etc = makeDraft(files, top)) {
        problem = fillEtc(files, etc.get());
    }
    if (!problem && !files.rename(top, kDraft, top, "etc")) {
        problem = cannotMake("etc");
    }
    if (problem) {
        removeTree(files, top, kDraft, removed);
    }
    return problem;
}

// `made` tells whether there was none.
Problem makeHome(FileSystem& files, int top, bool& made) {
    made = files.makeDirectory(top, "home", 0755);
    if (!made) {
        return errno == EEXIST ? Problem() : cannotMake("home");
    }
    const Descriptor home = files.open(top, "home", kOpenDirectory);
    if (home && files.changeMode(home.get(), 0755)) {
        return {};
    }
    files.removeDirectory(top, "home");
    return cannotMake("home");
}

// The etc comes last: with it, there is a root.
Problem fillRoot(FileSystem& files, int top) {
    if (::flock(top, LOCK_EX | LOCK_NB) != 0) {
        return "the directory cannot be locked";
    }
    if (!isFree(files, top, "etc")) {
        return "there is an etc already";
    }
    bool madeHome = false;
    if (Problem problem = makeHome(files, top, madeHome)) {
        return problem;
    }
    Problem problem = makeEtc(files, top);
    if (problem && madeHome) {
        files.removeDirectory(top, "home");
    }
    return problem;
}

Problem makeRoot(const std::filesystem::path& path, FileSystem& files) {
    std::error_code error;
    std::filesystem::create_directories(path, error);
    const Descriptor top = files.open(AT_FDCWD, path.native(), kOpenDirectory);
    if (error || !top || path.native().find('\0') != std::string::npos) {
        return "the directory cannot be made or opened";
    }
    return fillRoot(files, top.get());
}

} // namespace

CommandOutcome initRoot(const std::filesystem::path& directory) {
    try {
        if (const Problem problem = makeRoot(directory, systemFiles())) {
            return {false, *problem};
        }
        return {true, "A root directory was made."};
    } catch (const std::filesystem::filesystem_error&) {
        return {false, "the directory cannot be made or opened"};
    }
}

} // namespace qelo::store
