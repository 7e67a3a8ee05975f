#include "CommandTest.h"

#include "ScratchRoot.h"

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <sys/stat.h>
#include <unistd.h>

namespace qelo::test {

namespace fs = std::filesystem;

namespace {

std::vector<std::string> split(const std::string& text, char separator) {
    std::vector<std::string> fields{""};
    for (const char c : text) {
        if (c == separator) {
            fields.emplace_back();
        } else {
            fields.back() += c;
        }
    }
    return fields;
}

bool isLeftOut(const std::string& path) {
    const std::string name = path.substr(path.rfind('/') + 1);
    return name == ".qelosim.lock" || name == ".pwd.lock" ||
           (path.rfind("etc/", 0) == 0 && name.back() == '-');
}

std::string describe(const fs::path& path) {
    struct stat status {};
    ::lstat(path.c_str(), &status);
    std::ostringstream text;
    text << std::oct << status.st_mode << " " << std::dec << status.st_uid << ":" << status.st_gid;
    if (S_ISLNK(status.st_mode)) {
        text << " -> " << fs::read_symlink(path).native();
    } else if (S_ISREG(status.st_mode)) {
        text << "\n" << contentOf(path);
    }
    return text.str();
}

// The tools bring every change to the disk, which takes far longer than all the rest: so a
// file system in memory, where there is one and nobody wants another.
fs::path scratchBase() {
    const bool chosen = std::getenv("TMPDIR") != nullptr;
    return !chosen && ::access("/dev/shm", W_OK) == 0 ? fs::path("/dev/shm")
                                                      : fs::temp_directory_path();
}

} // namespace

ScratchDirectory::ScratchDirectory() {
    std::string pattern = (scratchBase() / "qelo-commands-XXXXXX").native();
    if (::mkdtemp(pattern.data()) == nullptr) {
        ADD_FAILURE() << "no scratch directory";
    }
    path_ = fs::canonical(pattern);
}

ScratchDirectory::~ScratchDirectory() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
}

std::string text(const std::string& name, const std::string& value) {
    return name + ":CMPI_string:" + value;
}

std::string number(const std::string& name, long value) {
    return name + ":CMPI_uint32:" + std::to_string(value);
}

std::string dateTime(const std::string& name, const std::string& value) {
    return name + ":CMPI_dateTime:" + value;
}

std::string command(const std::string& method, const std::vector<std::string>& arguments) {
    std::string line = method;
    for (const std::string& argument : arguments) {
        line += "," + argument;
    }
    return line;
}

std::string contentOf(const fs::path& file) {
    std::ifstream stream(file, std::ios::binary);
    std::ostringstream content;
    content << stream.rdbuf();
    return content.str();
}

void write(const fs::path& file, const std::string& content) {
    std::ofstream stream(file, std::ios::binary | std::ios::trunc);
    stream << content;
}

std::map<std::string, std::string> stateOf(const fs::path& root) {
    std::map<std::string, std::string> state;
    for (const auto& entry : fs::recursive_directory_iterator(root)) {
        const std::string path = entry.path().lexically_relative(root).native();
        if (!isLeftOut(path)) {
            state[path] = describe(entry.path());
        }
    }
    return state;
}

std::vector<std::string> lineOf(const fs::path& file, const std::string& key) {
    std::istringstream lines(contentOf(file));
    std::string line;
    while (std::getline(lines, line)) {
        const std::vector<std::string> fields = split(line, ':');
        if (fields.front() == key) {
            return fields;
        }
    }
    return {};
}

bool isSuperuser() { return ::geteuid() == 0; }

CommandTest::CommandTest() : root_(scratch_.path() / "root") {
    const store::CommandOutcome made = store::initRoot(root_);
    EXPECT_TRUE(made.accepted) << made.status;
}

void CommandTest::TearDown() {
    if (!expectFaults_) {
        EXPECT_THAT(findFaults(root_), testing::IsEmpty());
    }
}

store::CommandOutcome CommandTest::run(const std::string& method,
                                       const std::vector<std::string>& arguments) const {
    return store::executeAdminCommand(root_, command(method, arguments));
}

void CommandTest::accept(const std::string& method,
                         const std::vector<std::string>& arguments) const {
    const store::CommandOutcome outcome = run(method, arguments);
    EXPECT_TRUE(outcome.accepted) << command(method, arguments) << ": " << outcome.status;
    EXPECT_FALSE(outcome.status.empty());
}

std::string CommandTest::refuse(const std::string& method,
                                const std::vector<std::string>& arguments) const {
    const auto before = stateOf(root_);
    const store::CommandOutcome outcome = run(method, arguments);
    EXPECT_FALSE(outcome.accepted) << command(method, arguments) << ": " << outcome.status;
    EXPECT_FALSE(outcome.status.empty());
    EXPECT_EQ(before, stateOf(root_)) << command(method, arguments);
    return outcome.status;
}

std::vector<std::string> CommandTest::passwd(const std::string& name) const {
    return lineOf(etc("passwd"), name);
}

std::vector<std::string> CommandTest::shadow(const std::string& name) const {
    return lineOf(etc("shadow"), name);
}

std::vector<std::string> CommandTest::group(const std::string& name) const {
    return lineOf(etc("group"), name);
}

} // namespace qelo::test
