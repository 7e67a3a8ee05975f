#include "AccountFileLock.h"

#include "FileText.h"

#include <cerrno>
#include <charconv>
#include <csignal>
#include <fcntl.h>
#include <thread>
#include <unistd.h>
#include <utility>

namespace qelo::store {

namespace {

constexpr std::chrono::milliseconds kPause{20};

using Clock = std::chrono::steady_clock;

// The C library's lckpwdf() takes this very lock, but waits for it with an alarm signal, which
// a library in somebody else's process must not touch.
Descriptor takeLibraryLock(const RootDirectory& root, FileSystem& files, Clock::time_point end) {
    Descriptor file = files.open(root.etc(), ".pwd.lock", O_WRONLY | O_CREAT, 0600);
    struct flock whole {};
    whole.l_type = F_WRLCK;
    whole.l_whence = SEEK_SET;
    while (file && ::fcntl(file.get(), F_SETLK, &whole) != 0) {
        if ((errno != EACCES && errno != EAGAIN && errno != EINTR) || Clock::now() >= end) {
            file.reset();
        } else {
            std::this_thread::sleep_for(kPause);
        }
    }
    return file;
}

// Makes the file that is to be linked to the lock's name.
bool makeHolderFile(FileSystem& files, int etc, const std::string& name) {
    files.removeFile(etc, name);
    std::string text = std::to_string(::getpid());
    text.push_back('\0');
    return !writeNewFile(files, etc, name, text, 0600);
}

enum class Linked { Yes, Held, Failed };

Linked tryLink(FileSystem& files, int etc, const std::string& holder, const std::string& lock) {
    if (files.link(etc, holder, lock)) {
        return Linked::Yes;
    }
    if (errno != EEXIST) {
        return Linked::Failed;
    }
    if (isStaleLock(files, etc, lock)) {
        files.removeFile(etc, lock);
    }
    return Linked::Held;
}

bool linkUntil(FileSystem& files, int etc, const std::string& name, Clock::time_point end) {
    const std::string holder = name + "." + std::to_string(::getpid());
    const std::string lock = name + ".lock";
    if (!makeHolderFile(files, etc, holder)) {
        return false;
    }
    Linked linked = tryLink(files, etc, holder, lock);
    while (linked == Linked::Held && Clock::now() < end) {
        std::this_thread::sleep_for(kPause);
        linked = tryLink(files, etc, holder, lock);
    }
    removeSurely(files, etc, holder);
    return linked == Linked::Yes;
}

} // namespace

Attempt<AccountFileLock> AccountFileLock::take(const RootDirectory& root, FileSystem& files,
                                               const std::string& name,
                                               std::chrono::milliseconds limit) {
    const auto end = Clock::now() + limit;
    const Refusal refusal{"cannot lock etc/" + name};
    Descriptor libraryLock;
    if (root.isSystemRoot()) {
        libraryLock = takeLibraryLock(root, files, end);
        if (!libraryLock) {
            return refusal;
        }
    }
    if (!linkUntil(files, root.etc(), name, end)) {
        return refusal;
    }
    return AccountFileLock(files, root.etc(), name, std::move(libraryLock));
}

AccountFileLock::AccountFileLock(FileSystem& files, int etc, std::string name,
                                 Descriptor libraryLock)
    : files_(&files), etc_(etc), name_(std::move(name)), libraryLock_(std::move(libraryLock)) {}

AccountFileLock::AccountFileLock(AccountFileLock&& other) noexcept
    : files_(other.files_), etc_(other.etc_), name_(std::exchange(other.name_, {})),
      libraryLock_(std::move(other.libraryLock_)) {}

AccountFileLock::~AccountFileLock() {
    if (!name_.empty()) {
        removeSurely(*files_, etc_, name_ + ".lock");
    }
}

// A lock that cannot be understood counts as held, as it does for the tools. One with our own
// number was left by an earlier process of that number: within this process the store's own
// lock lets only one command come here.
bool isStaleLock(FileSystem& files, int etc, const std::string& lock) {
    const Attempt<std::string> text = readSmallFile(files, etc, lock);
    pid_t holder = 0;
    if (!text ||
        std::from_chars(text->data(), text->data() + text->size(), holder).ec != std::errc() ||
        holder <= 0) {
        return false;
    }
    return holder == ::getpid() || (::kill(holder, 0) != 0 && errno == ESRCH);
}

} // namespace qelo::store
